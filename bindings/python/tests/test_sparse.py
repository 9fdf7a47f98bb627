"""The sparse grid of records, beside a dictionary."""
import threading

import numpy as np
import pytest

from basalt import Sparse2DArray

PASS = np.dtype({"names": ["height", "count"], "formats": ["f4", "i2"], "offsets": [0, 6], "itemsize": 12})


@pytest.mark.parametrize("dtype", ["u1", "f4", "f8", PASS, [("x", "f8"), ("name", "S5")]])
def test_batches_agree_with_a_dictionary(dtype):
    array = Sparse2DArray(dtype, block_side=4, elements_per_chunk=16)
    random = np.random.default_rng(1)
    model = {}
    for _ in range(20):
        x, y = random.integers(-40, 40, (2, 200))
        elements = np.zeros(200, dtype=array.dtype)
        elements.view(np.uint8)[...] = random.integers(1, 100, elements.nbytes)
        array.insert(x, y, elements)
        model.update({(int(a), int(b)): element.tobytes() for a, b, element in zip(x, y, elements)})
        gone_x, gone_y = random.integers(-40, 40, (2, 60))
        expected = [model.pop((int(a), int(b)), None) is not None for a, b in zip(gone_x, gone_y)]
        assert array.remove(gone_x, gone_y).tolist() == expected
    x, y = np.mgrid[-41:41, -41:41]
    elements, found = array.find(x, y)
    assert elements.shape == found.shape == x.shape
    zero = bytes(array.dtype.itemsize)
    for a, b, element, there in zip(x.flat, y.flat, elements.flat, found.flat):
        assert there == ((a, b) in model)
        assert element.tobytes() == model.get((a, b), zero)
    for chosen, wanted in ((array.all(), model), (array.select((-7, 3), (12, 9)),
                           {c: e for c, e in model.items() if -7 <= c[0] <= 12 and 3 <= c[1] <= 9})):
        got = {(int(a), int(b)): element.tobytes() for a, b, element in zip(*chosen)}
        assert got == wanted and len(chosen[0]) == len(wanted)
    array.clear()
    assert len(array.all()[0]) == 0


def test_cells_of_the_whole_plane_and_none_beyond():
    array = Sparse2DArray("f8")
    edges = [-(2**31), 2**31 - 1]
    array.insert(edges, edges, [1.0, 2.0])
    assert array.find(edges, edges)[0].tolist() == [1.0, 2.0]
    assert len(array.select((edges[0],) * 2, (edges[1],) * 2)[0]) == 2
    assert len(array.select((5, 5), (0, 0))[0]) == 0
    for bad in (2**31, -(2**31) - 1):
        with pytest.raises(ValueError):
            array.insert(bad, 0, 1.0)
        with pytest.raises(ValueError):
            array.select((0, 0), (0, bad))
    with pytest.raises(TypeError):
        array.find(0.5, 0)
    with pytest.raises(ValueError):
        array.insert([1, 2], [1, 2, 3], 0.0)
    with pytest.raises(ValueError):
        array.insert([1, 2], [1, 2], [1.0, 2.0, 3.0])
    assert len(array.all()[0]) == 2


def test_elements_are_plain_and_results_live_on_their_own():
    for bad in ("O", [("a", "O")], "V0", ("f8", (3,))):
        with pytest.raises(TypeError):
            Sparse2DArray(bad)
    with pytest.raises(ValueError):
        Sparse2DArray("f8", block_side=0)
    array = Sparse2DArray("f8")
    array.insert(np.arange(1000), 7, np.arange(1000.0))
    x, y, elements = array.select((10, 0), (19, 10))
    array.clear()
    del array
    assert x.tolist() == list(range(10, 20)) and set(y) == {7} and elements.tolist() == list(range(10, 20))
    array = Sparse2DArray("i8")
    array.insert([], [], [])
    assert array.find([], [])[0].shape == (0,)


def test_nothing_is_cut_on_the_way_in():
    whole = Sparse2DArray("i2")
    whole.insert([0, 1], 0, [-(2**15), 2**15 - 1])
    whole.insert(2, 0, np.uint64(7))
    assert whole.find([0, 1, 2], 0)[0].tolist() == [-(2**15), 2**15 - 1, 7]
    for bad in (2**15, [2**40], np.uint64(2**64 - 1)):
        with pytest.raises(ValueError):
            whole.insert(0, 0, bad)
    for bad in (1.5, [2.0], 1j, np.array(["7"])):
        with pytest.raises(TypeError):
            whole.insert(0, 0, bad)
    single = Sparse2DArray("f4")
    single.insert([0, 1, 2], 0, np.array([0.5, -1.0, 3.0]))  # a narrower type of the same kind, explicitly
    assert single.find([0, 1, 2], 0)[0].tolist() == [0.5, -1.0, 3.0]
    with pytest.raises(TypeError):
        single.insert(0, 0, np.array([1j]))


def test_fields_go_by_their_names():
    array = Sparse2DArray([("height", "f8"), ("count", "i4")])
    array.insert([0, 1], 0, [(1.5, 2), (2.5, 3)])
    array.insert([2], 0, np.array([(3.5, 4)], [("height", "f4"), ("count", "i8")]))
    assert array.find([0, 1, 2], 0)[0].tolist() == [(1.5, 2), (2.5, 3), (3.5, 4)]
    for other in ([("count", "i4"), ("height", "f8")], [("height", "f8")], [("height", "f8"), ("count", "f8")], "f8"):
        with pytest.raises(TypeError):
            array.insert(0, 0, np.zeros((), other))
    assert array.find(0, 0)[0].item() == (1.5, 2)


def test_threads_share_an_array():
    array = Sparse2DArray("i8")
    cells = np.arange(20_000)

    def work(row):
        for _ in range(5):
            array.insert(cells, row, cells * row)
            assert (array.find(cells, row)[0] == cells * row).all()
            array.select((0, row), (1000, row))

    threads = [threading.Thread(target=work, args=(row,)) for row in range(1, 5)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join()
    x, y, elements = array.all()
    assert len(x) == 80_000 and (elements == x.astype(int) * y).all()
