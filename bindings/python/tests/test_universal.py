"""Universal functions beside the facts of the calls that they name, and how they take arrays."""
import pathlib
import re
import threading
import time
import tracemalloc

import numpy as np
import pytest

from basalt import geo, time_scales, units

FACTS = (pathlib.Path(__file__).resolve().parents[3] / "tests" / "data" / "geometry.facts").read_text()
OTHERWISE = {  # held in tests of their own
    "in_polygon", "in_polygon_or_near", "on_polyline", "polygon_area", "polygon_perimeter", "date_to_mjd",
    "calendar_to_java_time", "java_time_to_calendar", "current_java_time", "radians_to_dms", "GEO_INFINITY", "GEO_NULL",
    "LocalFrame", "PreparedPolygon", "format_angle", "parse_angle"}
BOUND = {name: getattr(module, name) for module in (geo, time_scales, units) for name in module.__all__}
# Which numbers of the call are the function's arguments, and which of its results are the function's, where not all.
ARGUMENTS = {
    **dict.fromkeys(("horizontal_distance", "horizontal_distance_squared", "grid_bearing", "direct",
                     "geodesic_inverse", "great_circle_distance", "great_circle_bearing"), [0, 1, 3, 4]),
    **dict.fromkeys(("triangle_area", "bearing_intersection", "cross_track"), [0, 1, 3, 4, 6, 7]),
    **dict.fromkeys(("lines_cross", "divergence_of_lines"), [0, 1, 3, 4, 6, 7, 9, 10]),
    "height_difference": [2, 5], "on_line": [0, 1, 3, 4, 6, 7, 9], "vector_bearing": [0, 1], "first_face": [0, 1],
    "vector_slope_angle_along_x": [0, 2], "vector_slope_angle_along_y": [1, 2],
    "calculate_observation": [0, 1, 2, 4, 5, 6, 3, 7, 8]}
RESULTS = {
    "direct": [1, 2, 0], "first_face": [0, 1], "bearing_intersection": [1, 2],
    **dict.fromkeys(("llh_to_xyz", "xyz_to_llh", "xyz_to_local"), [1, 2, 3]),
    **dict.fromkeys(("covariance_to_llh", "covariance_to_neu"), [1, 2, 3, 4, 5, 6])}


def number(text):
    """77 is a result left untouched, which the package gives as NaN."""
    named = {"null": geo.GEO_NULL, "77": np.nan, "pi": np.pi}
    return named[text] if text in named else float(text.removesuffix("pi")) * (np.pi if text.endswith("pi") else 1)


def numbers(text):
    return [number(word) for word in text.split()]


def call_of(name):
    return name if name == "divergence_of_lines" else re.findall(r"\((?:basalt::)?(\w+)\)", BOUND[name].__doc__)[-1]


def facts(name):
    """Columns of arguments, rows of results and their tolerances, as the function has them."""
    lines = re.findall(rf"^{call_of(name)} ([^=\n]*)=([^~\n]*?)(?: ~ (\S+))?(?: subnormal)?$", FACTS, re.M)
    given, expected, tolerance = (np.array([numbers(line[part] or "0") for line in lines]) for part in range(3))
    given = list(given.T[ARGUMENTS.get(name, slice(None))])
    if name.startswith("covariance"):
        given[3:] = [np.stack(given[3:], axis=-1)]
    if name == "bearing_intersection":
        expected[expected[:, 0] == 0] = np.nan
    kinds = getattr(BOUND[name], "types", ["d" * len(given)])[0]
    return [column.astype(kind) for column, kind in zip(given, kinds)], \
        expected[:, RESULTS.get(name, slice(None))], tolerance


@pytest.mark.filterwarnings("error")
@pytest.mark.parametrize("name", sorted(BOUND.keys() - OTHERWISE))
def test_the_facts_of_the_call_hold_without_a_warning(name):
    given, expected, tolerance = facts(name)
    results = BOUND[name](*given)
    ours = np.stack(results, axis=-1) if isinstance(results, tuple) else results.reshape(expected.shape)
    with np.errstate(invalid="ignore"):
        agree = (ours == expected) | (np.isnan(ours) & np.isnan(expected)) | (abs(ours - expected) <= tolerance)
    assert agree.all(), (given, ours, expected)


def places(count):
    random = np.random.default_rng(1)
    return [random.uniform(*span, count) for span in ((-1.5, 1.5), (-3.1, 3.1), (-100.0, 9e3))]


@pytest.mark.parametrize("name, count", [("slope_distance", 6), ("direct", 4), ("llh_to_xyz", 3), ("xyz_to_llh", 3)])
def test_strides_do_not_matter_and_nothing_is_written_to(name, count):
    made = (places(3000) + places(3000))[:count]
    apart = [np.stack([column] * 3, axis=1)[::-1, 1] for column in made]
    for column in apart:
        column.flags.writeable = False
    whole, turned, one = (np.atleast_2d(BOUND[name](*given)) for given in (made, apart, [c[2000:2001] for c in made]))
    assert turned[:, ::-1].tobytes() == whole.tobytes() and (one[:, 0] == whole[:, 2000]).all()


def test_a_local_frame_agrees_with_single_conversions():
    llh = places(1000)
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
    distance = geo.horizontal_distance(np.arange(4.0).reshape(4, 1), np.arange(3.0), 0, 0)
    assert distance.shape == (4, 3) and distance[3, 2] == np.sqrt(13.0)
    assert isinstance(geo.horizontal_distance(0, 0, 3, 4), float)
    assert geo.horizontal_distance(np.empty((0, 3)), 1, 2, 3).shape == (0, 3)


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


def test_fields_of_observations_have_defaults():
    assert geo.reduce_observation(0, np.pi / 2, 100, 1000, 2000, 50) == pytest.approx((1100, 2000, 50))
    assert geo.calculate_observation(0, 0, 0, 3, 4, 0) == pytest.approx((np.arctan2(4, 3), np.pi / 2, 5))


def test_dates_and_angles_convert_both_ways():
    mjd = np.arange(44244, 70000, 13)
    year, month, day, weekday = time_scales.mjd_to_date(mjd)
    assert (time_scales.date_to_mjd(year, month, day) == mjd).all() and (weekday == (mjd + 3) % 7).all()
    stamp = time_scales.calendar_to_java_time(2024, 2, 29, 12, 30, 15, np.array([0, 999]))
    assert stamp.astype("datetime64[ms]")[1] == np.datetime64("2024-02-29T12:30:15.999")
    for count in (stamp, stamp.astype(np.int64)):
        assert [field[1] for field in time_scales.java_time_to_calendar(count)] == [2024, 2, 29, 12, 30, 15, 999, 4]
    assert time_scales.java_time_to_calendar(2**64 - 1)[:6] == (1969, 12, 31, 23, 59, 59)
    assert 0 <= time_scales.current_java_time() - int(time.time() * 1000) + 5000 < 10_000
    assert time_scales.calendar_to_java_time(2023, 2, 29, 0, 0, 0, 0) == 2**64 - 1
    for dms in ((-12, 30, 1.5), (0, -30, -1.5), (12, 0, 0.25)):
        assert units.radians_to_dms(units.dms_to_radians(*dms)) == (*dms[:2], pytest.approx(dms[2]))
    assert units.parse_angle("0-30-01.5S") == pytest.approx(units.dms_to_radians(0, -30, -1.5), abs=1e-15)
    assert units.format_angle(np.deg2rad(-0.5), 1, "latitude") == "0-30-00.0S"


def test_the_facts_of_polygons_hold():
    for corners, rows in re.findall(r"^polygon ([^\n]+)\n(.*?)(?=^polygon|\n\n)", FACTS, re.M | re.S):
        norths, easts = np.array(numbers(corners)).reshape(-1, 2).T
        calls = {"in_polygon": geo.in_polygon, "in_band": geo.in_polygon_or_near, "on_polyline": geo.on_polyline}
        for name, given, result in re.findall(r"^(in_\w+|on_\w+) ([^=]*)= (\d)", rows, re.M):
            north, east, *tolerance = numbers(given)
            assert calls[name](north, east, norths, easts, *tolerance) == bool(int(result)), (corners, name, given)
        for result in re.findall(r"^area_and_perimeter = ([^~\n]*)", rows, re.M):
            ours = geo.polygon_area(norths, easts), geo.polygon_perimeter(norths, easts)
            np.testing.assert_allclose(ours, numbers(result), rtol=1e-14)


def test_points_meet_one_outline_or_one_each():
    random = np.random.default_rng(3)
    turns = np.sort(random.uniform(0, 2 * np.pi, 200))
    norths, easts = random.uniform(50, 100, 200) * [np.cos(turns), np.sin(turns)]
    north, east = random.uniform(-110, 110, (2, 5000))
    one_each = np.array([geo.in_polygon(*point, norths, easts) for point in zip(north, east)])
    prepared = geo.PreparedPolygon(norths, easts)
    outline = np.stack([norths, easts, easts], axis=1)
    assert 1000 < one_each.sum() < 4000
    for inside in (geo.in_polygon(north, east, norths, easts), prepared.contains(north, east),
                   geo.in_polygon(north, east, outline[:, 0], outline[:, 1])):
        assert (inside == one_each).all()
    grown = geo.in_polygon_or_near(north, east, norths, easts, [[0.5], [5.0]])
    assert grown.shape == (2, 5000) and (grown[0] >= one_each).all() and (grown[1] > grown[0]).any()
    assert (prepared.contains(north, east, [[0.5], [5.0]]) == grown).all()
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
