"""Paths taken apart and put together, and what lies in a folder, as the library's hosts see them.

What is put together has backslashes between its parts, which the library takes wherever it takes a path; other programs
need them replaced by slashes.
"""
import os
import typing

from ._basalt import combine_path as combine
from ._basalt import files_in_directory, set_extension, split_path

__all__ = ["Parts", "combine", "files_in_directory", "set_extension", "split"]


class Parts(typing.NamedTuple):
    """What a path is made of, without the marks between the parts."""

    drive: str
    directory: str
    name: str
    extension: str


def split(path: str | os.PathLike[str]) -> Parts:
    """The parts of a path (vex_util::CFilePath): "/site/day 1/levels.csv" has "site/day 1", "levels" and "csv"."""
    return Parts(*split_path(path))
