"""The sparse grid of records, beside a dictionary."""
from concurrent.futures import ThreadPoolExecutor

import numpy as np
import pytest

from basalt import Sparse2DArray

PASS = np.dtype({"names": ["height", "count"], "formats": ["f4", "i2"], "offsets": [0, 6], "itemsize": 12})


def within(model, low, high):
    return {(x, y): model[x, y] for x, y in model if low[0] <= x <= high[0] and low[1] <= y <= high[1]}


def taken(x, y, elements):
    return {(int(a), int(b)): element.tobytes() for a, b, element in zip(x, y, elements)}


@pytest.mark.parametrize("dtype", ["u1", "f4", "f8", PASS, [("x", "f8"), ("name", "S5")]])
def test_batches_agree_with_a_dictionary(dtype):
    array = Sparse2DArray(dtype, block_side=4, elements_per_chunk=16)
    random = np.random.default_rng(1)
    model = {}
    for _ in range(20):
        x, y = random.integers(-40, 40, (2, 200))
        x[:2] = y[:2] = -(2**31), 2**31 - 1
        elements = np.zeros(200, dtype=array.dtype)
        elements.view(np.uint8)[...] = random.integers(1, 100, elements.nbytes)
        array.insert(x, y, elements)
        model.update(taken(x, y, elements))
        x, y = random.integers(-40, 40, (2, 60))
        expected = [model.pop((int(a), int(b)), None) is not None for a, b in zip(x, y)]
        assert array.remove(x, y).tolist() == expected
    assert taken(*array.all()) == model and len(array) == len(model) == len(array.all()[0])
    assert taken(*array.select((-7, 3), (12, 9))) == within(model, (-7, 3), (12, 9))
    assert len(array.select((5, 5), (0, 0))[0]) == 0
    assert set(array) == set(model) and f"{len(model)} cells" in repr(array)
    x, y = np.mgrid[-41:31, -20:10]
    elements, found = array.find(x, y)
    window, zero = taken(x.flat, y.flat, elements.flat), bytes(array.dtype.itemsize)
    assert window == {cell: model.get(cell, zero) for cell in window}
    assert set(zip(x[found], y[found])) == within(model, (-41, -20), (30, 9)).keys()
    dense, filled = array.window((-41, -20), (30, 9))
    assert dense.tobytes() == elements.T.tobytes() and (filled == found.T).all()
    copy = Sparse2DArray(dtype)
    copy.insert_window((-41, -20), dense)
    assert (copy.window((-41, -20), (30, 9))[0] == dense).all() and len(copy) == dense.size
    assert copy.remove_window((0, 0), (2**31 - 1, 2**31 - 1)) == 31 * 10 and len(copy) == dense.size - 310
    assert (-1, 9) in copy and (0, 0) not in copy
    array.clear()
    assert len(array.all()[0]) == 0


@pytest.mark.parametrize("error, call", [
    (ValueError, lambda array: Sparse2DArray("f8", block_side=0)),
    (TypeError, lambda array: Sparse2DArray("f4").insert(0, 0, np.array([1j]))),
    (ValueError, lambda array: array.insert(2**31, 0, 1.0)),
    (ValueError, lambda array: array.insert(-(2**31) - 1, 0, 1.0)),
    (ValueError, lambda array: array.select((0, 0), (0, 2**31))),
    (ValueError, lambda array: array.select((0, 0), (0, -(2**31) - 1))),
    (TypeError, lambda array: array.find(0.5, 0)),
    (ValueError, lambda array: array.insert([1, 2], [1, 2, 3], 0.0)),
    (ValueError, lambda array: array.insert([1, 2], [1, 2], [1.0, 2.0, 3.0])),
    (ValueError, lambda array: array.insert_window((2**31 - 1, 0), [1, 2])),
    (ValueError, lambda array: array.insert_window((0, 2**31 - 1), [[1], [2]])),
    (KeyError, lambda array: array[0, 1]),
    (ValueError, lambda array: array.update([1, 1], 5, lambda elements, found: elements)),
    (ValueError, lambda array: array.update([0, 1], 5, lambda elements, found: [1, 2, 3])),
    (KeyError, lambda array: array.update([0, 1], 5, lambda elements, found: array[9, 9])),
])
def test_what_is_refused_changes_nothing(error, call):
    array = Sparse2DArray("f8")
    array[0, 0] = 1.0
    with pytest.raises(error):
        call(array)
    assert set(array) == {(0, 0)}


def test_elements_are_plain_and_results_live_on_their_own():
    for bad in ("O", [("a", "O")], "V0", ("f8", (3,))):
        with pytest.raises(TypeError):
            Sparse2DArray(bad)
    array = Sparse2DArray("f8")
    array.insert(np.arange(1000), 7, np.arange(1000.0))
    x, y, elements = array.select((10, 0), (19, 10))
    del array
    assert x.tolist() == list(range(10, 20)) and set(y) == {7} and elements.tolist() == list(range(10, 20))


def test_nothing_is_cut_on_the_way_in():
    whole = Sparse2DArray("i2")
    whole.insert([0, 1], 0, [-(2**15), 2**15 - 1])
    whole.insert(2, 0, np.uint64(7))
    assert whole.find([0, 1, 2], 0)[0].tolist() == [-(2**15), 2**15 - 1, 7]
    for bad in (2**15, [2**40], np.uint64(2**64 - 1), 1.5, [2.0], 1j, np.array(["7"])):
        with pytest.raises(ValueError if np.asarray(bad).dtype.kind in "iu" else TypeError):
            whole.insert(0, 0, bad)
    single = Sparse2DArray("f4")
    single.insert([0, 1, 2], 0, np.array([0.5, -1.0, 3.0]))  # a narrower type of the same kind, explicitly
    assert single.find([0, 1, 2], 0)[0].tolist() == [0.5, -1.0, 3.0]


def test_fields_go_by_their_names():
    array = Sparse2DArray([("height", "f8"), ("count", "i4")])
    array.insert([0, 1], 0, [(1.5, 2), (2.5, 3)])
    array.insert([2], 0, np.array([(3.5, 4)], [("height", "f4"), ("count", "i8")]))
    assert array.find([0, 1, 2], 0)[0].tolist() == [(1.5, 2), (2.5, 3), (3.5, 4)]
    for other in ([("count", "i4"), ("height", "f8")], [("height", "f8")], [("height", "f8"), ("count", "f8")], "f8"):
        with pytest.raises(TypeError):
            array.insert(0, 0, np.zeros((), other))
    assert array.find(0, 0)[0].item() == (1.5, 2)


def test_cells_are_read_written_and_changed_in_place():
    array = Sparse2DArray("i4")
    array[3, -4] = 7
    array[[0, 1], 5] = [1, 2]
    assert array[3, -4] == 7 and array[[1, 0], 5].tolist() == [2, 1]
    array.update([0, 1, 2], 5, lambda elements, found: elements + 10 * found + 1)
    array.update(3, -4, lambda elements, found: elements + array[0, 5])
    assert array[np.arange(3), 5].tolist() == [12, 13, 1] and array[3, -4] == 19
    array.insert([], [], [])
    array.insert_window((0, 0), [])
    assert len(array) == 4 and array.find([], [])[0].shape == (0,) and array.window((1, 1), (0, 0))[0].shape == (0, 0)


def test_threads_share_an_array():
    array = Sparse2DArray("i8")
    cells = np.arange(20_000)

    def work(row):
        for _ in range(5):
            array.insert(cells, row, cells * row)
            assert (array.find(cells, row)[0] == cells * row).all()
            array.select((0, row), (1000, row))
            array.update([0, 1], 0, lambda elements, found: elements + 1)

    with ThreadPoolExecutor(4) as pool:
        list(pool.map(work, range(1, 5)))
    x, y, elements = array.all()
    assert len(x) == 80_002 and (elements[y > 0] == (x.astype(int) * y)[y > 0]).all()
    assert array[[0, 1], 0].tolist() == [20, 20]
