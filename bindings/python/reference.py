#!/usr/bin/env python3
"""Prints the reference of the package as a page: signatures and help of all that its modules offer.

Usage: reference.py [PAGE]      with a page compares it instead, and fails where it is stale
"""
import inspect
import pathlib
import re
import sys

import numpy as np

import basalt

HEAD = """# Python reference

What `help()` has of each function and class, by module. Functions of numbers are NumPy universal functions: arguments
are broadcast, `out=` and `where=` are taken. Angles are radians, lengths metres.
"""


def as_page(text):
    """Help as Markdown: signs that mean something there as they are, and the C++ names at the end as code."""
    text = re.sub(r"\(([\w:]*(?:_|::)\w[\w:]*|factorial|Varxyz2var\w+)\)", r"(`\1`)", " ".join(text.split()))
    return re.sub(r"(?<!`)([*<>|^])", r"\\\1", text)


def signature_and_help(item):
    text = inspect.getdoc(item) or ""
    if isinstance(item, np.ufunc):  # NumPy puts a signature without names before ours
        text = text.split("\n\n", 1)[1]
    if not inspect.isfunction(item) and not inspect.isclass(item):
        if found := re.match(rf"{getattr(item, '__name__', '')}(\(.*?\)(?: -> \w+)?)(?:: |\n\n)", text):
            return found[1], text[found.end():]
        return "", text
    parameters = list(inspect.signature(item, eval_str=False).parameters.values())
    shown = [parameter.name if parameter.default is parameter.empty else f"{parameter.name}={parameter.default!r}"
             for parameter in parameters if parameter.name not in ("self", "options")]
    return f"({', '.join(shown)})", text


def entry(name, item, indent="- "):
    signature, text = signature_and_help(item)
    plain = signature.replace("*", "\\*").replace("<", "\\<")
    yield f"{indent}**{name}**{plain}: {as_page(text)}"
    if inspect.isclass(item):
        for key, member in vars(item).items():
            if not key.startswith("_") and (inspect.isfunction(member) or isinstance(member, property)):
                yield from entry(key, member, "  " + indent)


def page():
    lines = [HEAD]
    for module in (basalt.geo, basalt.units, basalt.time_scales, basalt.sparse, basalt.files, basalt.hexadecimal):
        lines += [f"## {module.__name__.replace('.sparse', '')}", "", as_page(module.__doc__), ""]
        for name in module.__all__:
            item = getattr(module, name)
            lines += [f"- **{name}** = {item!r}"] if isinstance(item, float) else entry(name, item)
        lines.append("")
    return "\n".join(lines)


def main():
    if len(sys.argv) > 2 or sys.argv[1:] in (["-h"], ["--help"]):
        sys.exit(__doc__)
    if len(sys.argv) < 2:
        print(page(), end="")
    elif pathlib.Path(sys.argv[1]).read_text("utf-8") != page():
        sys.exit(f"{sys.argv[1]}: stale; scripts/python.sh reference writes it again")


if __name__ == "__main__":
    main()
