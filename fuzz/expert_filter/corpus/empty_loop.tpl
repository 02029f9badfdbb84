[!foreach(none)]
body[!set(ran,yes)]
[!endforeach]
[!ran] [!endforeach]
