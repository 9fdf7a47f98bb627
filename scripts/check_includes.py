#!/usr/bin/env python3
"""Holds the direction of inclusion: who may include whom, and who may see the operating system."""
import pathlib
import re
import sys

FAMILIES = {"frame": set(), "geo": set(), "util": set(), "files": set(), "memory": {"frame"},
            "sparse": {"memory"}, "graphics": {"frame", "geo"}}
STANDARD = re.compile(r"^[a-z_0-9]+$|^(stddef|stdint|string)\.h$")  # <vector>, and what C shares
INTRINSICS = {"immintrin.h", "emmintrin.h"}

root = pathlib.Path(__file__).resolve().parent.parent
errors = []
for file in sorted([*root.glob("src/**/*.h"), *root.glob("src/**/*.cpp"), *root.glob("include/**/*.h")]):
    path = file.relative_to(root)
    text = file.read_bytes()
    if any(byte > 126 or (byte < 32 and byte != 10) for byte in text):
        errors.append(f"{path}: not plain ASCII with LF line ends")
    room = path.parts[1] if path.parts[0] == "src" and len(path.parts) > 2 else None
    for number, line in enumerate(text.decode("utf-8", "replace").splitlines(), 1):
        match = re.match(r'\s*#\s*include\s*([<"])([^>"]+)[>"]', line)
        if not match:
            continue
        name, allowed = match[2], True
        if match[1] == "<":
            allowed = STANDARD.match(name) or room == "platform" or name in INTRINSICS
        elif path.parts[0] == "include":
            allowed = name.startswith("basalt/")
        elif name.startswith("src/") and room is not None:
            other = name.split("/")[1]
            allowed = other in {room, "platform"} or other in FAMILIES.get(room, set())
            allowed = allowed and not (room == "platform" and other != "platform")
        elif name.startswith("basalt/") and room == "platform":
            allowed = name.startswith(("basalt/platform", "basalt/export"))
        if not allowed:
            errors.append(f"{path}:{number}: may not include {name}")
sys.exit("\n".join(errors) if errors else 0)
