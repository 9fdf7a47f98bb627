"""Universal functions against plain loops in C++: the same bits, however the arrays lie."""
import threading
import time
import tracemalloc

import numpy as np
import pytest
from plain_loops import FUNCTIONS, SIX_AT_ONCE, arguments, columns

from basalt import geo, time_scales, units


def bound(name):
    return next(getattr(module, name) for module in (geo, time_scales, units) if hasattr(module, name))


def called(name, made):
    results = bound(name)(*arguments(name, made))
    if name in SIX_AT_ONCE:
        return [np.ascontiguousarray(column) for column in results.T]
    return list(results) if isinstance(results, tuple) else [results]


@pytest.mark.parametrize("name", FUNCTIONS)
def test_results_are_those_of_the_library_to_the_bit(name, plain_loops):
    made = columns(name, 20_000)
    if name == "xyz_to_llh":
        made[0][0] = made[1][0] = made[2][0] = 0.0  # the earth's centre: nothing is formed
    for ours, theirs in zip(called(name, made), plain_loops.run(name, made), strict=True):
        assert ours.astype(float)[1:].tobytes() == theirs[1:].tobytes()
        assert ours.dtype != bool or (ours.any() and not ours.all()), "nothing was told apart"
    if name == "xyz_to_llh":
        assert all(np.isnan(result[0]) for result in called(name, made))


def test_nothing_is_bound_that_is_not_held_against_the_library():
    names = {name for module in (geo, time_scales, units) for name in module.__all__}
    outlines = {"in_polygon", "in_polygon_or_near", "on_polyline"}  # held in a test of their own
    assert names == set(FUNCTIONS) | outlines | {"GEO_INFINITY", "GEO_NULL", "current_java_time"}


@pytest.mark.parametrize("name", ["slope_distance", "direct", "mjd_to_gps"])
def test_strides_do_not_matter_and_nothing_is_written_to(name):
    made = columns(name, 3000)
    whole = called(name, made)
    lying_apart = []
    for column in made:
        room = np.full((len(column), 3), np.nan)
        room[:, 1] = column
        lying_apart.append(room[:, 1][::-1])
        lying_apart[-1].flags.writeable = False
    for ours, theirs in zip(called(name, lying_apart), whole, strict=True):
        assert ours[::-1].tobytes() == theirs.tobytes()


def test_arrays_are_read_where_they_stand():
    count = 1_000_000
    room = np.zeros((count, 2))
    out = np.empty(count)

    def taken(work):
        tracemalloc.start()
        try:
            work()
            return tracemalloc.get_traced_memory()[1]
        finally:
            tracemalloc.stop()

    assert taken(lambda: room[:, 0].copy()) >= room.nbytes // 2  # what a copy would be seen as
    for column in (room[:, 0], room[::-1, 1], out):
        assert taken(lambda: geo.horizontal_distance(column, room[:, 1], 0, 1, out=out)) < 100_000


def test_arrays_are_broadcast_and_scalars_stay_scalars():
    north = np.arange(4.0).reshape(4, 1)
    east = np.arange(3.0)
    distance = geo.horizontal_distance(north, east, 0, 0)
    assert distance.shape == (4, 3)
    assert distance[3, 2] == np.sqrt(13.0)
    assert isinstance(geo.horizontal_distance(0, 0, 3, 4), float)
    assert geo.horizontal_distance(np.empty((0, 3)), 1, 2, 3).shape == (0, 3)
    out = np.zeros(3)
    assert geo.horizontal_distance(0, east, 0, 0, out=out) is out
    assert out.tolist() == [0, 1, 2]


def test_what_is_no_number_or_no_shape_is_refused():
    with pytest.raises(TypeError):
        geo.horizontal_distance("north", 0, 0, 0)
    with pytest.raises(ValueError):
        geo.horizontal_distance(np.zeros(3), np.zeros(4), 0, 0)
    with pytest.raises(TypeError):
        time_scales.mjd_to_date(0.5)
    with pytest.raises(TypeError):
        geo.direct(0, 0, 0)


@pytest.mark.filterwarnings("error")
def test_documented_answers_to_bad_input_come_without_a_warning():
    assert np.isnan(geo.llh_to_xyz(0.0, 0.0, 0.0)).all()
    assert geo.reduce_observation(geo.GEO_NULL, 1.0, 10.0, 0, 0, 0) == (geo.GEO_NULL,) * 3
    assert np.isnan(geo.calculate_observation(geo.GEO_NULL, 0, 0, 1, 1, 1)).all()
    assert np.isnan(geo.bearing_intersection(0, 0, 0, 10, 0.0, 0.0)).all()  # side by side
    assert geo.bearing_intersection(0, 0, 0, 10, np.pi / 4, -np.pi / 4) == pytest.approx((5, 5))
    assert np.isnan(geo.direct(np.inf, 0, 0, 1)).all()
    assert units.radians_to_dms(np.nan)[:2] == (0, 0)


def test_whole_numbers_out_of_range_raise_wherever_they_stand():
    with pytest.raises(ValueError):
        time_scales.date_to_mjd([2024, 70000, 2024], 1, 1)
    with pytest.raises(ValueError):
        time_scales.mjd_to_date(-1)
    with pytest.raises(ValueError):
        units.dms_to_radians(2**31, 0, 0.0)


def test_dates_and_lengths_go_there_and_back():
    mjd = np.arange(44244, 70000, 13)
    year, month, day, weekday = time_scales.mjd_to_date(mjd)
    assert (time_scales.date_to_mjd(year, month, day) == mjd).all()
    assert (weekday == (mjd + 3) % 7).all()  # MJD 4 was a Sunday
    stamp = time_scales.calendar_to_java_time(2024, 2, 29, 12, 30, 15, np.array([0, 999]))
    assert stamp.tolist() == [1709209815000, 1709209815999]
    assert [field[1] for field in time_scales.java_time_to_calendar(stamp)] == [2024, 2, 29, 12, 30, 15, 999, 4]
    for count in (1709209815000, np.int64(1709209815000), np.uint64(1709209815000)):
        assert time_scales.java_time_to_calendar(count)[:6] == (2024, 2, 29, 12, 30, 15)
    assert time_scales.java_time_to_calendar(stamp.astype(np.int64))[0].tolist() == [2024, 2024]
    assert time_scales.java_time_to_calendar(2**64 - 1)[:6] == (1969, 12, 31, 23, 59, 59)
    with pytest.raises(ValueError):
        time_scales.java_time_to_calendar(-1)
    assert stamp.astype("datetime64[ms]")[1] == np.datetime64("2024-02-29T12:30:15.999")
    assert 0 <= time_scales.current_java_time() - int(time.time() * 1000) + 5000 < 10_000
    assert time_scales.calendar_to_java_time(2023, 2, 29, 0, 0, 0, 0) == 2**64 - 1
    assert units.metres_to_feet_inches(-1200 / 3937 * 5.5, 16) == (False, 5, pytest.approx(6.0), 0, 0)
    assert units.feet_inches_to_metres(5, 6.0, 0, 0) == pytest.approx(1200 / 3937 * 5.5)
    assert units.radians_to_dms(units.dms_to_radians(-12, 30, 1.5)) == (-12, 30, pytest.approx(1.5))


def test_points_meet_one_outline_or_one_each(plain_loops):
    random = np.random.default_rng(3)
    turns = np.sort(random.uniform(0, 2 * np.pi, 200))
    radii = random.uniform(50, 100, 200)
    norths, easts = radii * np.cos(turns), radii * np.sin(turns)
    north, east = random.uniform(-110, 110, (2, 5000))
    outline = np.zeros((200, 3))
    outline[:, 0], outline[:, 1] = norths, easts
    expected = np.zeros(5000, dtype=bool)
    plain_loops.outline("in_polygon", north, east, outline, expected)
    assert 1000 < expected.sum() < 4000
    assert (geo.in_polygon(north, east, norths, easts) == expected).all()
    assert (geo.in_polygon(north, east, outline[:, 0], outline[:, 1]) == expected).all()
    grown = geo.in_polygon_or_near(north, east, norths, easts, [[0.5], [5.0]])
    assert grown.shape == (2, 5000)
    assert (grown[0] >= expected).all() and (grown[1] > grown[0]).any()
    for name in ("in_polygon_or_near", "on_polyline"):
        near = np.zeros(5000, dtype=bool)
        plain_loops.outline(name, north, east, outline, near, 5.0)
        assert (getattr(geo, name)(north, east, norths, easts, 5.0) == near).all()
        assert near.any() and not near.all()
    on_outline = geo.on_polyline(norths, easts, norths, easts, 0.01)
    assert on_outline.all()
    squares = np.array([0.0, 10.0])[:, None] + [0, 0, 4, 4]  # two, each with a point of its own
    assert geo.in_polygon([2.0, 2.0], [2.0, 2.0], squares, [0, 4, 4, 0]).tolist() == [True, False]


def test_covariances_travel_as_six_numbers():
    x, y, z = geo.llh_to_xyz(0.0, 0.0, 10.0)  # east is y, north is z, up is x
    covariance = np.array([[1, 2, 3, 0.1, 0.2, 0.3], [4, 5, 6, 0, 0, 0.0]])
    local = geo.covariance_to_neu(x, y, z, covariance)
    assert local == pytest.approx(np.array([[3, 2, 1, 0.3, 0.2, 0.1], [6, 5, 4, 0, 0, 0]]), abs=1e-12)
    assert (geo.covariance_to_llh(0, 0, 0, covariance) == geo.GEO_NULL).all()
    with pytest.raises(ValueError):
        geo.covariance_to_neu(x, y, z, covariance[:, :5])


def test_other_threads_run_meanwhile():
    made = columns("cross_track", 400_000)
    steps = 0
    done = threading.Event()

    def work():
        geo.cross_track(*made)
        done.set()

    thread = threading.Thread(target=work)
    thread.start()
    while not done.is_set():
        steps += 1
        time.sleep(0.001)
    thread.join()
    assert steps > 5  # a held interpreter lets one step through, at the end
