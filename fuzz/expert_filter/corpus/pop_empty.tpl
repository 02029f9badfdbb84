ok
[!endif]
