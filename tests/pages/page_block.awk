# Prints a page's program: its first ```cpp block, under the page's own line numbers; -v program=N prints the N-th.
# With -v output=1 prints the ```text block that follows it: what the program writes.
BEGIN { if (!program) program = 1 }
/^```/ && !inside {
    inside = 1
    kind = substr($0, 4)
    if (kind == "cpp") ++seen
    wanted = seen == program && kind == (output ? "text" : "cpp")
    if (wanted && !output) printf "#line %d \"%s\"\n", NR + 1, FILENAME
    next
}
/^```/ {
    if (wanted) exit
    inside = 0
    next
}
wanted
