#!/usr/bin/env python3
"""Holds the direction of inclusion: who may include whom, and who may see the operating system.

Usage: check_includes.py        prints each include that breaks a rule, and each source that (tests aside) is not
plain ASCII
"""
import pathlib
import re
import sys

FAMILIES = {"frame": set(), "geo": set(), "util": set(), "files": set(), "memory": {"frame"},
            "sparse": {"memory"}, "graphics": {"frame", "geo"}}
STANDARD = re.compile(r"^[a-z_0-9]+$|^(stddef|stdint|string)\.h$")  # <vector>, and what C shares
INTRINSICS = {"immintrin.h", "emmintrin.h"}
OUTSIDE = {"bindings", "console", "examples", "tools"}
SOURCES = [f"{folder}/**/*{ending}"  # not those of tests, which hold texts
           for folder in ("include", "src", "bench", "bindings", "fuzz", "examples", "console", "tools")
           for ending in (".h", ".cpp")]


def may_include(path, room, quoted, name):
    if not quoted:
        return room == "platform" or name in INTRINSICS or STANDARD.match(name)
    first, _, rest = name.partition("/")
    if path.parts[0] == "include":
        return first == "basalt"
    if first == "basalt":
        return room != "platform" or rest.startswith(("platform", "export"))
    if first != "src":  # a path relative to the file would hide which room it leads to
        return False
    if room is None:
        return path.name == "module.cpp"
    other = rest.partition("/")[0]
    return other in {room, "platform"} or other in FAMILIES.get(room, set())


def main():
    root = pathlib.Path(__file__).resolve().parent.parent
    errors = []
    for file in sorted(file for pattern in SOURCES for file in root.glob(pattern)):
        path = file.relative_to(root)
        text = file.read_bytes()
        if any(byte > 126 or (byte < 32 and byte != 10) for byte in text):
            errors.append(f"{path}: not plain ASCII with LF line ends")
        if path.parts[0] in OUTSIDE and re.search(r'^\s*#\s*include\s*"(src|tests|bench)/', text.decode("ascii", "replace"),
                                                  re.M):
            errors.append(f"{path}: may include include/basalt/ alone")
        if path.parts[0] not in ("include", "src"):
            continue
        room = path.parts[1] if path.parts[0] == "src" and len(path.parts) > 2 else None
        for number, line in enumerate(text.decode("utf-8", "replace").splitlines(), 1):
            match = re.match(r'\s*#\s*include\s*([<"])([^>"]+)[>"]', line)
            if match and not may_include(path, room, match[1] == '"', match[2]):
                errors.append(f"{path}:{number}: may not include {match[2]}")
    sys.exit("\n".join(errors) if errors else 0)


if __name__ == "__main__":
    if len(sys.argv) > 1:
        sys.exit(__doc__)
    main()
