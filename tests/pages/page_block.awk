# Prints a page's program: its first ```cpp block, under the page's own line numbers. With -v output=1 prints the
# ```text block that follows the program: what the program writes.
/^```/ && !inside {
    inside = 1
    kind = substr($0, 4)
    wanted = output ? program && kind == "text" : kind == "cpp"
    if (kind == "cpp") program = 1
    if (wanted && !output) printf "#line %d \"%s\"\n", NR + 1, FILENAME
    next
}
/^```/ {
    if (wanted) exit
    inside = 0
    next
}
wanted
