// Writes what was run before a process ends by _Exit, which leaves it out (linked with --wrap).
extern "C" {

void __gcov_dump();
[[noreturn]] void __real__Exit(int code);

[[noreturn]] void __wrap__Exit(int code) {
    __gcov_dump();
    __real__Exit(code);
}
}
