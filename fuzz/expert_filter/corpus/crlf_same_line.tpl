begin
[!foreach(i in items)][!i.x][!endforeach]|[!i.x]
