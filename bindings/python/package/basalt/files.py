"""Parts of paths, and the files of a folder, as the library's hosts see them.

A backslash separates as a slash does; results have slashes only, so that any program can open them.
"""
from __future__ import annotations

import os
import typing

from . import _basalt

__all__ = ["Parts", "combine", "files_in_directory", "set_extension", "split"]

_Path = typing.Union[str, "os.PathLike[str]"]


class Parts(typing.NamedTuple):
    """Parts of a path, without the marks between them."""

    drive: str
    directory: str
    name: str
    extension: str


def _slashes(path: str) -> str:
    return path.replace("\\", "/")


def split(path: _Path) -> Parts:
    """The parts of a path (vex_util::CFilePath): "/site/day 1/levels.csv" has "site/day 1", "levels" and "csv"."""
    return Parts(*map(_slashes, _basalt.split_path(path)))


def combine(first: _Path, second: _Path) -> str:
    """Both in one path, with one slash between them (vex_util::CFilePath::Combine)."""
    first = os.fspath(first)
    return _slashes(_basalt.combine_path(first[:-1] if first.endswith(("/", "\\")) else first, second))


def set_extension(path: _Path, extension: str) -> str:
    """The path with another extension, given without its dot (vex_util::CFilePath::SetExtension)."""
    return _slashes(_basalt.set_extension(path, extension))


def files_in_directory(directory: _Path, pattern: str) -> list[str]:
    """Absolute paths of a directory's entries, folders too, whose names match a pattern with * and ?.

    Empty where there is no such directory (vex_util::CFilePath::GetFilesInDirectory).
    """
    folder = os.path.join(os.path.abspath(_slashes(os.fspath(directory))), "")  # the library needs both
    return [_slashes(path) for path in _basalt.files_in_directory(folder, pattern)]
