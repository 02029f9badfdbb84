unit [!Name];

[!if=(Flag)]
flag on
[!else]
flag off
[!endif]
