[!foreach(i of items)]
[!if=]
[!settings]
