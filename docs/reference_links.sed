# What the reference does with the links of a page: a header has a page there, and a folder has none.
s#\]\((\.\./)*include/(basalt/[a-z_/]+\.h)\)#](@ref \2)#g
s#\[([^]]*)\]\((\.\./)*(bindings|examples|src|tools)/[^)]*\)#\1#g
