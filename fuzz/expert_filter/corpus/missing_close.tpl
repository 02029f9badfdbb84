a[!b]c[!d
