[!set(a,"x\ny\t\"q\"")]
[!set(b 'it\'s')]
[!a]|[!b]
