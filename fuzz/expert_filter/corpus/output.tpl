before[!outputoff]
hidden
[!outputon]after
[!outputproperties]
