"""Paths and hexadecimal text."""
import os

import pytest

from basalt import files, hexadecimal


def test_hexadecimal_text_there_and_back():
    every = bytes(range(256))
    assert hexadecimal.encode(every) == every.hex()
    assert hexadecimal.decode(every.hex().upper()) == every
    assert hexadecimal.decode("") == b""
    for bad in ("abc", "0g", "00\0a"):
        with pytest.raises(ValueError):
            hexadecimal.decode(bad)


def test_paths_are_taken_apart_and_put_together(tmp_path):
    assert files.split("/site/day 1/lev\u00e9.tar.gz") == ("", "site/day 1", "lev\u00e9.tar", "gz")
    assert files.combine("/site", "levels.csv") == files.combine("/site\\", "levels.csv") == "/site/levels.csv"
    assert files.set_extension("/site/levels.csv", "txt") == "/site/levels.txt"
    with pytest.raises(ValueError):
        files.split("a\0b")
    (tmp_path / "a.csv").touch()
    (tmp_path / "b.txt").touch()
    listed = files.files_in_directory(f"{tmp_path}/", "*.csv")
    assert listed == [str(tmp_path / "a.csv")]
    assert files.files_in_directory(tmp_path / "none", "*") == []
    assert files.files_in_directory(os.path.relpath(tmp_path), "*.csv") == listed


def test_names_that_are_no_text_lead_to_their_files(tmp_path):
    name = os.fsdecode(b"level\xff.csv")
    (tmp_path / name).touch()
    (listed,) = files.files_in_directory(f"{tmp_path}/", "*.csv")
    assert os.path.exists(listed) and listed.endswith(name)
    assert files.split(tmp_path / name)[2:] == (name[:-4], "csv")
    assert files.split(tmp_path).name == ""  # a directory is one wherever the disk says so
    for bad in (b"/site", 5, None):
        with pytest.raises(TypeError):
            files.split(bad)
