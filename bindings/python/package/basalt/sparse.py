"""A sparse grid of records: elements of one dtype at the integer cells of the whole signed 32-bit plane."""
from __future__ import annotations

import operator
from collections.abc import Callable, Iterator

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
    """What is given as an array of the dtype. No value is truncated, and no field is taken for another."""
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
            raise ValueError(f"a number is out of the range of {dtype}")
        return made
    numbers = natural.dtype.kind in "biufc" and dtype.kind in "biufc"
    if natural.size and (numbers or hasattr(given, "dtype")) and not np.can_cast(natural.dtype, dtype, "same_kind"):
        raise TypeError(f"elements are {dtype}, not {natural.dtype}")
    return np.asarray(given, dtype=dtype)


def _bytes(given, dtype, shape):
    elements = np.broadcast_to(_elements(given, dtype), shape)
    return np.ascontiguousarray(elements).reshape(-1).view(np.uint8)


def _corners(minimum, maximum):
    corners = [operator.index(c) for c in (*minimum, *maximum)]
    if len(corners) != 4 or min(corners) < _LEAST or max(corners) > _GREATEST:
        raise ValueError("expected two cells of 32 bits as corners")
    return corners


class Sparse2DArray:
    """Elements of one dtype by cell (vex_util::Sparse2DArray), in batches.

    array[x, y] is the element of a cell, or those of arrays of cells, KeyError where one is empty; (x, y) in array, len
    and iteration are of the filled cells. Records are copied in and out. Any thread may call at any time; a batch is
    one step for the others. block_side is rounded up to a power of two; elements_per_chunk is how many elements are
    taken from the heap at a time.
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
        """Of an element."""
        return self._dtype

    def __repr__(self) -> str:
        return f"<Sparse2DArray of {self._dtype}, {len(self)} cells>"

    def __len__(self) -> int:
        return self._array.size()

    def __contains__(self, cell: tuple[int, int]) -> bool:
        return bool(self.find(*cell)[1].all())

    def __iter__(self) -> Iterator[tuple[int, int]]:
        """The filled cells of this moment, ordered as select."""
        x, y, _ = self._array.all()
        return zip(x.tolist(), y.tolist())

    def __getitem__(self, cell: tuple[npt.ArrayLike, npt.ArrayLike]):
        elements, found = self.find(*cell)
        if not found.all():
            raise KeyError(cell)
        return elements[()]

    def __setitem__(self, cell: tuple[npt.ArrayLike, npt.ArrayLike], elements: npt.ArrayLike) -> None:
        self.insert(*cell, elements)

    def insert(self, x: npt.ArrayLike, y: npt.ArrayLike, elements: npt.ArrayLike) -> None:
        """Copies elements into their cells, over those already there; a later one of the same cell wins.

        Numbers of another dtype are converted where none is truncated; records have the dtype's field names.
        """
        x, y, shape = _cells(x, y)
        self._array.insert(x, y, _bytes(elements, self._dtype, shape))

    def find(self, x: npt.ArrayLike, y: npt.ArrayLike) -> tuple[np.ndarray, np.ndarray]:
        """(elements, found): the elements of cells, zero where there is none, and whether there is one."""
        x, y, shape = _cells(x, y)
        elements, found = self._array.find(x, y)
        return elements.view(self._dtype).reshape(shape), found.reshape(shape)

    def update(self, x: npt.ArrayLike, y: npt.ArrayLike,
               change: Callable[[np.ndarray, np.ndarray], npt.ArrayLike]) -> None:
        """Inserts what change(elements, found) makes of find(x, y), in one step for other threads.

        ValueError where a cell is given twice. change may use this array, but must not wait for a thread that does.
        """
        x, y, shape = _cells(x, y)
        if np.unique(x.astype(np.int64) * 2**32 + y).size != x.size:
            raise ValueError("a cell is given twice")

        def changed(elements, found):
            made = change(elements.view(self._dtype).reshape(shape), found.reshape(shape))
            return _bytes(made, self._dtype, shape)

        self._array.update(x, y, changed)

    def insert_window(self, minimum: tuple[int, int], elements: npt.ArrayLike) -> None:
        """Inserts a row or a table of elements: x ascends along the last axis, y along the first, from the cell given.

        Faster than insert, which is given every cell.
        """
        elements = np.atleast_2d(_elements(elements, self._dtype))
        rows, columns = elements.shape
        x, y = minimum
        x, y, _, _ = _corners((x, y), (x + max(columns - 1, 0), y + max(rows - 1, 0)))
        if elements.size:
            self._array.insert_rows(x, y, columns, _bytes(elements, self._dtype, elements.shape))

    def window(self, minimum: tuple[int, int], maximum: tuple[int, int]) -> tuple[np.ndarray, np.ndarray]:
        """(elements, found) of every cell of a rectangle, as find: cell (x, y) at [y - min_y, x - min_x]."""
        x, y, max_x, max_y = _corners(minimum, maximum)
        rows, columns = max(max_y - y + 1, 0), max(max_x - x + 1, 0)
        elements, found = np.zeros((rows, columns), self._dtype), np.zeros((rows, columns), bool)
        if elements.size:
            self._array.copy_rows(x, y, columns, elements.reshape(-1).view(np.uint8), found.reshape(-1))
        return elements, found

    def remove_window(self, minimum: tuple[int, int], maximum: tuple[int, int]) -> int:
        """Empties the cells of a rectangle, and returns how many held an element."""
        return self._array.remove_window(*_corners(minimum, maximum))

    def remove(self, x: npt.ArrayLike, y: npt.ArrayLike) -> np.ndarray:
        """Empties cells, and returns which of them held an element."""
        x, y, shape = _cells(x, y)
        return self._array.remove(x, y).reshape(shape)

    def clear(self) -> None:
        """Removes all elements and releases all memory."""
        self._array.clear()

    def select(self, minimum: tuple[int, int], maximum: tuple[int, int]) -> tuple[np.ndarray, np.ndarray, np.ndarray]:
        """(x, y, elements) of what lies in a rectangle, given by the least and the greatest cell, both inside it.

        In the order of visits: by blocks in no order, in a block by rows of ascending y and x.
        """
        x, y, elements = self._array.select(*_corners(minimum, maximum))
        return x, y, elements.view(self._dtype)

    def all(self) -> tuple[np.ndarray, np.ndarray, np.ndarray]:
        """(x, y, elements) of everything, ordered as select."""
        x, y, elements = self._array.all()
        return x, y, elements.view(self._dtype)
