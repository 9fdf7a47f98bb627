"""The extension module as others meet it: what it shows to the loader, and what its stubs say of it."""
import ast
import importlib.metadata
import inspect
import pathlib
import subprocess

import numpy as np

from basalt import __version__, _basalt


def test_the_library_inside_lends_no_symbol():
    shown = subprocess.run(["nm", "-D", "--defined-only", "-C", _basalt.__file__], check=True, capture_output=True,
                           text=True).stdout
    assert "PyInit__basalt" in shown
    assert subprocess.run(["nm", _basalt.__file__], capture_output=True).stdout == b"", "stripped"
    assert not [line for line in shown.splitlines() if "geo_" in line or "vex_util" in line or "Heap" in line]


def test_the_version_is_that_of_package_and_library():
    assert __version__ == importlib.metadata.version("basalt")


def test_the_stubs_name_what_is_there():
    stubs = ast.parse(pathlib.Path(_basalt.__file__).with_name("_basalt.pyi").read_text())
    named, universal = set(), set()
    for node in stubs.body:
        if isinstance(node, ast.AnnAssign):
            (universal if ast.unparse(node.annotation) == "np.ufunc" else named).add(node.target.id)
        elif isinstance(node, (ast.FunctionDef, ast.ClassDef)):
            named.add(node.name)
    there = {name: value for name, value in vars(_basalt).items() if not name.startswith("__")}
    assert named | universal == set(there)
    assert universal == {name for name, value in there.items() if isinstance(value, np.ufunc)}
    for name in universal:
        own = inspect.getdoc(there[name]).split("\n\n", 1)[1]  # below the line that NumPy writes
        assert name.startswith("_") or own.startswith(f"{name}("), "the help names the arguments"
        assert "latitude" not in own.split(":")[0] or "\nIn radians: latitude" in own
