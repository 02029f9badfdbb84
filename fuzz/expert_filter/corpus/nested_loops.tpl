[!foreach(item in items)]
<[!item.name]=[!item.x]>
[!foreach(c in item.children)]
  - [!c.name]
[!endforeach]
[!endforeach]
