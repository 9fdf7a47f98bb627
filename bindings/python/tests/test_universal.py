"""Universal functions beside their plain forms in NumPy, and how they take arrays."""
import pathlib
import threading
import time
import tracemalloc

import numpy as np
import pytest
from plain_forms import FUNCTIONS, SIX_AT_ONCE, along_edge, arguments, columns, cross

from basalt import geo, time_scales, units

DATA = pathlib.Path(__file__).resolve().parents[3] / "tests" / "data"
OTHERWISE = {  # held in tests of their own
    "in_polygon", "in_polygon_or_near", "on_polyline", "direct", "cross_track", "mjd_to_date", "java_time_to_calendar",
    "radians_to_dms", "metres_to_feet_inches", "GEO_INFINITY", "GEO_NULL", "current_java_time", "geodesic_inverse",
    "LocalFrame", "PreparedPolygon", "format_angle", "parse_angle"}


def bound(name):
    return next(getattr(module, name) for module in (geo, time_scales, units) if hasattr(module, name))


def called(name, made):
    results = bound(name)(*arguments(name, made))
    if name in SIX_AT_ONCE:
        return list(results.T)
    return list(results) if isinstance(results, tuple) else [results]


def test_every_function_is_tested():
    names = {name for module in (geo, time_scales, units) for name in module.__all__}
    assert names == set(FUNCTIONS) | OTHERWISE


@pytest.mark.parametrize("name", FUNCTIONS)
def test_results_agree_with_the_plain_form(name):
    made = columns(name, 2000)
    plain = FUNCTIONS[name][1](*made)
    for ours, expected in zip(called(name, made), plain if isinstance(plain, list) else [plain], strict=True):
        if ours.dtype == bool:
            assert (ours == expected).all() and ours.any() and not ours.all()
        else:
            np.testing.assert_allclose(ours, expected, rtol=0, atol=1e-10 * np.nanmax(np.abs(expected)))


def test_geodesics_end_where_an_independent_program_has_them():
    rows = np.loadtxt(DATA / "geodesics.csv", delimiter=",")
    p1, l1, a1, s, p2, l2, _ = rows.T[:7]
    distance, azimuth, _ = geo.geodesic_inverse(*np.deg2rad([p1, l1, p2, l2]))
    np.testing.assert_allclose(distance, s, rtol=0, atol=2e-8)
    for start_azimuth in (np.deg2rad(a1), azimuth):
        latitude, longitude, _ = geo.direct(*np.deg2rad([p1, l1]), start_azimuth, s)
        np.testing.assert_allclose(latitude, np.deg2rad(p2), rtol=0, atol=1e-10)
        east = (np.mod(longitude - np.deg2rad(l2) + np.pi, 2 * np.pi) - np.pi) * np.cos(latitude)
        np.testing.assert_allclose(east, 0, rtol=0, atol=1e-10)
    assert geo.cross_track(0, 0, 0, 0.01, 0.001, 0.005) == pytest.approx(6371, rel=1e-6)  # left of a line to the east
    assert geo.cross_track(0, 0.01, 0, 0, 0.001, 0.005) == pytest.approx(-6371, rel=1e-6)


@pytest.mark.parametrize("name", ["slope_distance", "direct", "llh_to_xyz", "xyz_to_llh", "mjd_to_gps"])
def test_strides_do_not_matter_and_nothing_is_written_to(name):
    made = columns(name, 3000) if name in FUNCTIONS else columns("great_circle_distance", 3000)
    apart = []
    for column in made:
        wide = np.full((len(column), 3), np.nan)
        wide[:, 1] = column
        apart.append(wide[:, 1][::-1])
        apart[-1].flags.writeable = False
    one = called(name, [column[2000:2001] for column in made])
    for ours, theirs, single in zip(called(name, apart), called(name, made), one, strict=True):
        assert ours[::-1].tobytes() == theirs.tobytes() and single[0] == theirs[2000]


def test_a_local_frame_agrees_with_single_conversions():
    llh = columns("llh_to_xyz", 1000)
    xyz = geo.llh_to_xyz(*llh)
    frame = geo.LocalFrame(0.8, 0.1, 300.0)
    local = np.array(geo.xyz_to_local(*geo.llh_to_xyz(0.8, 0.1, 300.0), *xyz))
    for ours in (frame.llh_to_local(*llh), frame.xyz_to_local(*xyz)):
        assert np.array(ours).tobytes() == local.tobytes()
    np.testing.assert_allclose(frame.local_to_xyz(*local), xyz, rtol=0, atol=1e-6)
    llh = np.array(geo.xyz_to_llh(*frame.local_to_xyz(*local), np.full(1000, 5e-10)))
    assert llh.tobytes() == np.array(frame.local_to_llh(*local)).tobytes()
    assert frame.valid and not geo.LocalFrame(0, 0, 0).valid
    assert geo.LocalFrame(0, 0, 0).xyz_to_local(1.0, 2.0, 3.0) == (geo.GEO_NULL,) * 3


def test_arrays_are_not_copied():
    wide, out = np.zeros((1_000_000, 2)), np.empty(1_000_000)
    tracemalloc.start()
    geo.horizontal_distance(wide[:, 0], wide[::-1, 1], 0, out, out=out)
    assert tracemalloc.get_traced_memory()[1] < 100_000
    tracemalloc.stop()


def test_arrays_are_broadcast_and_scalars_stay_scalars():
    north, east = np.arange(4.0).reshape(4, 1), np.arange(3.0)
    distance = geo.horizontal_distance(north, east, 0, 0)
    assert distance.shape == (4, 3) and distance[3, 2] == np.sqrt(13.0)
    assert isinstance(geo.horizontal_distance(0, 0, 3, 4), float)
    assert geo.horizontal_distance(np.empty((0, 3)), 1, 2, 3).shape == (0, 3)
    out = np.zeros(3)
    assert geo.horizontal_distance(0, east, 0, 0, out=out) is out and out.tolist() == [0, 1, 2]


@pytest.mark.parametrize("error, call", [
    (TypeError, lambda: geo.horizontal_distance("north", 0, 0, 0)),
    (ValueError, lambda: geo.horizontal_distance(np.zeros(3), np.zeros(4), 0, 0)),
    (TypeError, lambda: time_scales.mjd_to_date(0.5)),
    (TypeError, lambda: geo.direct(0, 0, 0)),
    (ValueError, lambda: time_scales.date_to_mjd([2024, 70000, 2024], 1, 1)),
    (ValueError, lambda: time_scales.mjd_to_date(-1)),
    (ValueError, lambda: time_scales.date_to_mjd(2023, [2, 13], [29, 1])),
    (ValueError, lambda: geo.PreparedPolygon([0, 1], [0, 1, 2])),
    (ValueError, lambda: units.parse_angle("12-60")),
    (ValueError, lambda: units.format_angle(1.0, 0, "east")),
    (ValueError, lambda: units.dms_to_radians(2**31, 0, 0.0)),
    (ValueError, lambda: time_scales.java_time_to_calendar(-1)),
    (ValueError, lambda: geo.covariance_to_neu(6e6, 0, 0, np.zeros((2, 5)))),
])
def test_arguments_of_a_wrong_kind_shape_or_range_are_refused(error, call):
    with pytest.raises(error):
        call()


@pytest.mark.filterwarnings("error")
def test_documented_results_of_bad_input_come_without_a_warning():
    assert np.isnan(geo.llh_to_xyz(0.0, 0.0, 0.0)).all()
    assert np.isnan(geo.xyz_to_llh(0.0, 0.0, 0.0)).all()
    assert geo.reduce_observation(geo.GEO_NULL, 1.0, 10.0, 0, 0, 0) == (geo.GEO_NULL,) * 3
    assert np.isnan(geo.calculate_observation(geo.GEO_NULL, 0, 0, 1, 1, 1)).all()
    assert np.isnan(geo.bearing_intersection(0, 0, 0, 10, 0.0, 0.0)).all()  # parallel
    assert np.isnan(geo.direct(np.inf, 0, 0, 1)).all()
    assert (geo.covariance_to_llh(0, 0, 0, np.ones((2, 6))) == geo.GEO_NULL).all()
    assert units.radians_to_dms(np.nan)[:2] == (0, 0)


def test_dates_and_lengths_convert_both_ways():
    mjd = np.arange(44244, 70000, 13)
    year, month, day, weekday = time_scales.mjd_to_date(mjd)
    assert (time_scales.date_to_mjd(year, month, day) == mjd).all()
    assert (weekday == (mjd + 3) % 7).all()  # MJD 4 was a Sunday
    stamp = time_scales.calendar_to_java_time(2024, 2, 29, 12, 30, 15, np.array([0, 999]))
    assert stamp.astype("datetime64[ms]")[1] == np.datetime64("2024-02-29T12:30:15.999")
    for count in (stamp, stamp.astype(np.int64)):
        assert [field[1] for field in time_scales.java_time_to_calendar(count)] == [2024, 2, 29, 12, 30, 15, 999, 4]
    assert time_scales.java_time_to_calendar(2**64 - 1)[:6] == (1969, 12, 31, 23, 59, 59)
    assert 0 <= time_scales.current_java_time() - int(time.time() * 1000) + 5000 < 10_000
    assert time_scales.calendar_to_java_time(2023, 2, 29, 0, 0, 0, 0) == 2**64 - 1
    assert units.metres_to_feet_inches(-1200 / 3937 * 5.5, 16) == (False, 5, pytest.approx(6.0), 0, 0)
    assert units.radians_to_dms(units.dms_to_radians(-12, 30, 1.5)) == (-12, 30, pytest.approx(1.5))
    assert units.radians_to_dms(units.dms_to_radians(0, -30, -1.5)) == (0, -30, pytest.approx(-1.5))
    assert units.parse_angle("0-30-01.5S") == pytest.approx(units.dms_to_radians(0, -30, -1.5), abs=1e-15)
    assert units.format_angle(np.deg2rad(-0.5), 1, "latitude") == "0-30-00.0S"


def test_points_meet_one_outline_or_one_each():
    random = np.random.default_rng(3)
    turns = np.sort(random.uniform(0, 2 * np.pi, 200))
    norths, easts = random.uniform(50, 100, 200) * [np.cos(turns), np.sin(turns)]
    north, east = random.uniform(-110, 110, (2, 5000))
    crossed = [cross(north, east, 0 * north, 0 * north + 200, norths[i - 1], easts[i - 1], norths[i], easts[i])
               for i in range(200)]
    inside = geo.in_polygon(north, east, norths, easts)
    assert (inside == np.sum(crossed, axis=0) % 2).all() and 1000 < inside.sum() < 4000
    assert (geo.in_polygon(north[:50], east[:50], norths, easts) == inside[:50]).all()  # too few to prepare for
    prepared = geo.PreparedPolygon(norths, easts)
    assert (prepared.contains(north, east) == inside).all()
    outline = np.stack([norths, easts, easts], axis=1)
    assert (geo.in_polygon(north, east, outline[:, 0], outline[:, 1]) == inside).all()
    grown = geo.in_polygon_or_near(north, east, norths, easts, [[0.5], [5.0]])
    assert grown.shape == (2, 5000) and (grown[0] >= inside).all() and (grown[1] > grown[0]).any()
    assert (prepared.contains(north, east, [[0.5], [5.0]]) == grown).all()
    edges = [(norths[i - 1], easts[i - 1], norths[i], easts[i]) for i in range(200)]
    near = np.any([geo.on_line(*edge[2:], *edge[:2], north, east, 5.0) for edge in edges], axis=0)
    assert (geo.in_polygon_or_near(north, east, norths, easts, 5.0) == (inside | near)).all()
    along = np.any([along_edge(*edge, north, east, 5.0) for edge in edges], axis=0)
    assert (geo.on_polyline(north, east, norths, easts, 5.0) == along).all() and along.any()
    squares = np.array([0.0, 10.0])[:, None] + [0, 0, 4, 4]  # two, each with a point of its own
    assert geo.in_polygon([2.0, 2.0], [2.0, 2.0], squares, [0, 4, 4, 0]).tolist() == [True, False]


def test_other_threads_run_meanwhile():
    made = [np.random.default_rng(1).uniform(0.1, 0.2, 400_000) for _ in range(6)]
    steps = 0
    thread = threading.Thread(target=geo.cross_track, args=made)
    thread.start()
    while thread.is_alive():
        steps += 1
        time.sleep(0.001)
    assert steps > 5  # a held interpreter lets one step through, at the end
