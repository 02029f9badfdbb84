unit [!Name];
[!foreach(i in items)]
  [!i.name] = [!i.x];
[!endforeach]
