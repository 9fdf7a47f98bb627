# Links of the pages in the reference: a header has a page there, and a folder's page is its README.
s#\]\((\.\./)*include/(basalt/[a-z_/]+\.h)\)#](@ref \2)#g
s#\]\(((\.\./)*(examples|tools|bindings/python|src/platform)/([a-z]+/)?)\)#](\1README.md)#g
s#\[([^]]*)\]\([a-z/_]*\.py\)#\1#g
s#\]\((\.\./)+docs/pictures/([a-z]+\.png)\)#](\2)#g
# A heading prints the marks of code.
/^#/s#`##g
