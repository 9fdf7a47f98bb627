"""Paths and hexadecimal text."""
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
    assert files.combine("/site", "levels.csv") == r"/site\levels.csv"
    assert files.set_extension("/site/levels.csv", "txt") == r"\site\levels.txt"
    with pytest.raises(ValueError):
        files.split("a\0b")
    (tmp_path / "a.csv").touch()
    (tmp_path / "b.txt").touch()
    listed = files.files_in_directory(f"{tmp_path}/", "*.csv")
    assert [path.replace("\\", "/") for path in listed] == [str(tmp_path / "a.csv")]
