"""Bytes as text of hexadecimal digits, two a byte, in lower case."""
from ._basalt import bytes_to_hex as encode
from ._basalt import hex_to_bytes as decode

__all__ = ["decode", "encode"]
