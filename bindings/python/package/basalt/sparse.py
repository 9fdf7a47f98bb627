"""A sparse grid of records: elements of one dtype at the integer cells of the whole signed 32-bit plane."""
from __future__ import annotations

import numpy as np
import numpy.typing as npt

from ._basalt import SparseBytes

__all__ = ["Sparse2DArray"]

_LEAST, _GREATEST = -(2**31), 2**31 - 1


def _cells(x, y):
    """x and y broadcast against each other, as flat arrays of 32 bits, and their common shape."""
    both = []
    for given in (np.asarray(x), np.asarray(y)):
        if given.dtype.kind not in "iu" and given.size:
            raise TypeError(f"cells are whole numbers, not {given.dtype}")
        if given.size and (given.min() < _LEAST or given.max() > _GREATEST):
            raise ValueError("a cell lies beyond 32 bits")
        both.append(given)
    x, y = np.broadcast_arrays(*both)
    return (np.ascontiguousarray(x, dtype=np.int32).reshape(-1), np.ascontiguousarray(y, dtype=np.int32).reshape(-1),
            x.shape)


def _elements(given, dtype):
    """What is given as an array of the dtype. Nothing is cut and no field taken for another on the way."""
    if getattr(given, "dtype", None) == dtype:
        return given if isinstance(given, np.ndarray) else np.asarray(given)
    if dtype.names is not None:  # tuples have no names; records that have go by theirs
        if hasattr(given, "dtype") and (given.dtype.names != dtype.names or
                                        not np.can_cast(given.dtype, dtype, "same_kind")):
            raise TypeError(f"elements are {dtype}, not {given.dtype}")
        return np.asarray(given, dtype=dtype)
    natural = np.asarray(given)
    if natural.dtype.kind in "iu" and dtype.kind in "iu":
        made = natural.astype(dtype)
        if not np.array_equal(made, natural):
            raise ValueError(f"{dtype} does not hold a number that is given")
        return made
    numbers = natural.dtype.kind in "biufc" and dtype.kind in "biufc"
    if natural.size and (numbers or hasattr(given, "dtype")) and not np.can_cast(natural.dtype, dtype, "same_kind"):
        raise TypeError(f"elements are {dtype}, not {natural.dtype}")
    return np.asarray(given, dtype=dtype)


class Sparse2DArray:
    """Elements of one dtype by cell (vex_util::Sparse2DArray), in batches.

    Records are copied in and out. Any thread may call at any time; a batch is one step for the others. block_side is
    rounded up to a power of two; elements_per_chunk is how many elements are taken from the heap at a time.
    """

    def __init__(self, dtype: npt.DTypeLike, block_side: int = 16, elements_per_chunk: int = 1024):
        self._dtype = np.dtype(dtype)
        if self._dtype.hasobject or self._dtype.itemsize == 0 or self._dtype.subdtype is not None:
            raise TypeError(f"elements are plain bytes of a fixed size, or records of such, not {self._dtype}")
        if not (0 < block_side <= 4096 and 0 < elements_per_chunk <= 2**24):
            raise ValueError("block_side is 1 to 4096 cells, elements_per_chunk 1 to 2^24")
        self._array = SparseBytes(self._dtype.itemsize, block_side, elements_per_chunk)

    @property
    def dtype(self) -> np.dtype:
        return self._dtype

    def insert(self, x: npt.ArrayLike, y: npt.ArrayLike, elements: npt.ArrayLike) -> None:
        """Copies elements into their cells, over those already there; a later one of the same cell wins.

        Numbers of another dtype are converted where nothing is cut by that; records have the dtype's field names.
        """
        x, y, shape = _cells(x, y)
        elements = np.broadcast_to(_elements(elements, self._dtype), shape)
        self._array.insert(x, y, np.ascontiguousarray(elements).reshape(-1).view(np.uint8))

    def find(self, x: npt.ArrayLike, y: npt.ArrayLike) -> tuple[np.ndarray, np.ndarray]:
        """(elements, found): the elements of cells, zero where there is none, and whether there is one."""
        x, y, shape = _cells(x, y)
        elements, found = self._array.find(x, y)
        return elements.view(self._dtype).reshape(shape), found.reshape(shape)

    def remove(self, x: npt.ArrayLike, y: npt.ArrayLike) -> np.ndarray:
        """Empties cells, and returns which of them held an element."""
        x, y, shape = _cells(x, y)
        return self._array.remove(x, y).reshape(shape)

    def clear(self) -> None:
        """Back to the new state, with all memory given back."""
        self._array.clear()

    def select(self, minimum: tuple[int, int], maximum: tuple[int, int]) -> tuple[np.ndarray, np.ndarray, np.ndarray]:
        """(x, y, elements) of what lies in a rectangle, given by the least and the greatest cell, both inside it.

        In the order of visits: by blocks, whose order means nothing, in a block by rows of ascending y and x.
        """
        corners = [int(c) for c in (*minimum, *maximum)]
        if len(corners) != 4 or min(corners) < _LEAST or max(corners) > _GREATEST:
            raise ValueError("two cells of 32 bits are wanted")
        x, y, elements = self._array.select(*corners)
        return x, y, elements.view(self._dtype)

    def all(self) -> tuple[np.ndarray, np.ndarray, np.ndarray]:
        """(x, y, elements) of everything, ordered as select."""
        x, y, elements = self._array.all()
        return x, y, elements.view(self._dtype)
