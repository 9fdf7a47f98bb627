#!/usr/bin/env python3
"""Checks the direction of inclusion: which folder may include which, and which may include system headers.

Usage: check_includes.py        prints each include that breaks a rule, each folder of more than 30 files, each source
(tests aside) that is not plain ASCII, and each call in src/geo of a function of the C library whose last bit depends on
the processor
"""
import pathlib
import re
import sys

FAMILIES = {"frame": set(), "geo": set(), "util": set(), "files": set(), "memory": {"frame"},
            "sparse": {"memory"}, "graphics": {"frame", "geo"}}
# The rooms of src/platform. The contract headers in src/platform itself ("") are open to every family and room.
ROOMS = {"": {"system", "text"}, "system": set(), "text": {"system"}, "errors": {"system", "text"},
         "heap": {"system", "errors"}, "clock": {"system"}, "disk": {"system", "text", "errors", "clock"},
         "program": {"system", "text", "errors"}, "pixels": set(), "drawing": {"pixels", "system", "text", "errors"}}
MOST_FILES = 30
STANDARD = re.compile(r"^[a-z_0-9]+$|^(stddef|stdint|string)\.h$")  # <vector>, and what C shares
INTRINSICS = {"immintrin.h", "emmintrin.h"}
INEXACT = re.compile(r"(?:std::|(?<![\w:.>]))(?:a?(?:sin|cos|tan)h?|atan2|sincos|exp[2m1]*|log(?:2|10|1p)?|pow|cbrt|hypot|fma|"
                     r"remquo|[tl]gamma|erfc?)\s*\(")
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
    other, _, inner = rest.partition("/")
    if other == "platform":
        theirs = inner.rpartition("/")[0]
        ours = "/".join(path.parts[2:-1])
        return theirs == "" or room == "platform" and (theirs == ours or theirs in ROOMS[ours])
    return other == room or other in FAMILIES.get(room, set())


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
            call = room == "geo" and INEXACT.search(line.partition("//")[0])
            if call and (path.parts[2] != "elementary" or call[0].startswith("std::")):
                errors.append(f"{path}:{number}: {call[0]}) differs between processors; see src/geo/elementary")
    for folder in sorted({file.parent for top in ("include", "src") for file in (root / top).glob("**/*.*")}):
        files = sum(file.is_file() for file in folder.iterdir())
        if files > MOST_FILES:
            errors.append(f"{folder.relative_to(root)}: {files} files, at most {MOST_FILES}")
    sys.exit("\n".join(errors) if errors else 0)


if __name__ == "__main__":
    if len(sys.argv) > 1:
        sys.exit(__doc__)
    main()
