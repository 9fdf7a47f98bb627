"""Each function of the package in plain NumPy, and the ranges its arguments are drawn from."""
import numpy as np

PI = np.pi
A, E2 = 6378137.0, 0.0066943799901413165  # WGS84
FOOT = 1200 / 3937  # US survey foot, metres
SPHERE = 6371000.0

LATITUDE, LONGITUDE, TURN, METRES = (-1.57, 1.57), (-3.14, 3.14), (-6.3, 6.3), (-5e5, 5e5)
NEAR, AROUND = (-1e-3, 1e-3), (-10.0, 10.0)  # where some of many points are equal, and some lines cross


def bearing(dn, de):
    return np.mod(np.arctan2(de, dn), 2 * PI)


def turn(b1, b2):
    return abs(np.mod(b2 - b1 + PI, 2 * PI) - PI)


def side(n1, e1, n2, e2, n, e):
    return np.sign((n2 - n1) * (e - e1) - (e2 - e1) * (n - n1))


def cross(*p):
    a, b, c, d = (p[i:i + 2] for i in range(0, 8, 2))
    return (side(*a, *b, *c) != side(*a, *b, *d)) & (side(*c, *d, *a) != side(*c, *d, *b))


def on_line(n1, e1, n2, e2, n, e, tolerance):
    """A band around the segment, square at its ends."""
    length = np.hypot(n2 - n1, e2 - e1)
    along = ((n - n1) * (n2 - n1) + (e - e1) * (e2 - e1)) / length
    off = ((n - n1) * (e2 - e1) - (e - e1) * (n2 - n1)) / length
    return (along >= -tolerance) & (along <= length + tolerance) & (abs(off) <= tolerance)


def along_edge(n1, e1, n2, e2, n, e, tolerance):
    """Near the line through the edge, and no farther from either end than its length and the tolerance allow."""
    squared = (n2 - n1) ** 2 + (e2 - e1) ** 2
    near = abs((n2 - n) * (e1 - e) - (e2 - e) * (n1 - n)) / np.sqrt(squared) < tolerance
    ends = np.maximum((n1 - n) ** 2 + (e1 - e) ** 2, (n2 - n) ** 2 + (e2 - e) ** 2)
    return near & (ends < squared + tolerance ** 2)


def rays_meet(n1, e1, n2, e2, b1, b2):
    det = np.sin(b1 - b2)
    s = ((e2 - e1) * np.cos(b2) - (n2 - n1) * np.sin(b2)) / det
    t = ((e2 - e1) * np.cos(b1) - (n2 - n1) * np.sin(b1)) / det
    ahead = (s > 0) & (t > 0)
    return [np.where(ahead, v, np.nan) for v in (n1 + s * np.cos(b1), e1 + s * np.sin(b1))]


def spiral(length, constant, _):
    u = np.linspace(0, 1, 201)[:, None] * length
    simpson = np.array([1] + [4, 2] * 99 + [4, 1])[:, None] / 600 * length
    return [(f(u * u / constant) * simpson).sum(axis=0) for f in (np.cos, np.sin)]


def follow(n, e, h, b, d, rise):
    return [n + d * np.cos(b), e + d * np.sin(b), h + rise]


def slope_along(across, up):
    return np.where(across > 1e-4, np.arctan(up / across), np.sign(up) * PI / 2)


def radii(latitude):
    w = np.sqrt(1 - E2 * np.sin(latitude) ** 2)
    return [A * (1 - E2) / w ** 3, A / w]


def to_xyz(latitude, longitude, height):
    n = radii(latitude)[1]
    across = (n + height) * np.cos(latitude)
    return [across * np.cos(longitude), across * np.sin(longitude), (n * (1 - E2) + height) * np.sin(latitude)]


def to_llh(x, y, z):
    latitude = np.arctan2(z, np.hypot(x, y) * (1 - E2))
    for _ in range(50):
        n = radii(latitude)[1]
        latitude = np.arctan2(z + E2 * n * np.sin(latitude), np.hypot(x, y))
    n = radii(latitude)[1]
    height = np.hypot(x, y) * np.cos(latitude) + z * np.sin(latitude) - A * A / n
    return [latitude, np.arctan2(y, x), height]


def axes(x, y, z):
    """Rows north, east, up at a place, one matrix a place."""
    p, l, _ = to_llh(x, y, z)
    sp, cp, sl, cl = np.sin(p), np.cos(p), np.sin(l), np.cos(l)
    return np.array([[-sp * cl, -sp * sl, cp], [-sl, cl, 0 * cl], [cp * cl, cp * sl, sp]]).transpose(2, 0, 1)


def to_local(x0, y0, z0, x, y, z):
    return list(np.einsum("kij,jk->ik", axes(x0, y0, z0), np.array([x - x0, y - y0, z - z0])))


def covariance_to_neu(x, y, z, *six):
    xx, yy, zz, xy, xz, yz = six
    matrix = np.array([[xx, xy, xz], [xy, yy, yz], [xz, yz, zz]]).transpose(2, 0, 1)
    turned = axes(x, y, z) @ matrix @ axes(x, y, z).transpose(0, 2, 1)
    return [turned[:, i, j] for i, j in ((0, 0), (1, 1), (2, 2), (0, 1), (0, 2), (1, 2))]


def covariance_to_llh(x, y, z, *six):
    p, _, height = to_llh(x, y, z)
    m, n = radii(p)
    scale = [1 / (m + height), 1 / ((n + height) * np.cos(p)), 1.0]
    pairs = ((0, 0), (1, 1), (2, 2), (0, 1), (0, 2), (1, 2))
    return [v * scale[i] * scale[j] for v, (i, j) in zip(covariance_to_neu(x, y, z, *six), pairs)]


def sphere_distance(p1, l1, p2, l2):
    half = np.sin((p2 - p1) / 2) ** 2 + np.cos(p1) * np.cos(p2) * np.sin((l2 - l1) / 2) ** 2
    return 2 * SPHERE * np.arcsin(np.sqrt(half))


def sphere_bearing(p1, l1, p2, l2):
    return bearing(np.cos(p1) * np.sin(p2) - np.sin(p1) * np.cos(p2) * np.cos(l2 - l1), np.sin(l2 - l1) * np.cos(p2))


def reduce_observation(hz, v, d, n, e, h, rise, scale):
    return [n + scale * d * np.sin(v) * np.cos(hz), e + scale * d * np.sin(v) * np.sin(hz), h + d * np.cos(v) + rise]


def calculate_observation(n1, e1, h1, n2, e2, h2, instrument, target, scale):
    flat, up = np.hypot(n2 - n1, e2 - e1) * scale, h2 + target - h1 - instrument
    return [bearing(n2 - n1, e2 - e1), np.arctan2(flat, up), np.hypot(flat, up)]


def days(year, month, day):
    return np.array([np.datetime64(f"{int(y):04}-{int(m):02}-{int(d):02}") for y, m, d in zip(year, month, day)]
                    ).astype("datetime64[D]").astype(np.int64) + 40587


# name: (range of each argument, plain form)
FUNCTIONS = {
    "horizontal_distance": ([METRES] * 4, lambda a, b, c, d: np.hypot(c - a, d - b)),
    "horizontal_distance_squared": ([METRES] * 4, lambda a, b, c, d: (c - a) ** 2 + (d - b) ** 2),
    "height_difference": ([METRES] * 2, lambda a, b: b - a),
    "slope_distance": ([METRES] * 6, lambda a, b, c, d, e, f: np.sqrt((d - a) ** 2 + (e - b) ** 2 + (f - c) ** 2)),
    "points_equal": ([NEAR] * 6, lambda *p: np.all([abs(p[i] - p[i + 3]) < .0005 for i in range(3)], axis=0)),
    "distances_equal": ([NEAR] * 2, lambda a, b: abs(a - b) < .0005),
    "midpoint": ([METRES] * 6, lambda *p: [(p[i] + p[i + 3]) / 2 for i in range(3)]),
    "grid_bearing": ([METRES] * 4, lambda a, b, c, d: bearing(c - a, d - b)),
    "slope_angle": ([METRES] * 6, lambda a, b, c, d, e, f: np.arctan2(f - c, np.hypot(d - a, e - b))),
    "grade": ([METRES] * 6, lambda a, b, c, d, e, f: (f - c) / np.hypot(d - a, e - b)),
    "triangle_area": ([METRES] * 6, lambda a, b, c, d, e, f: abs((c - a) * (f - b) - (e - a) * (d - b)) / 2),
    "polygon_area": ([METRES] * 2, lambda n, e: np.dot(n, np.roll(e, -1)) / 2 - np.dot(np.roll(n, -1), e) / 2),
    "polygon_perimeter": ([METRES] * 2, lambda n, e: np.hypot(n - np.roll(n, 1), e - np.roll(e, 1)).sum()),
    "normalise_bearing": ([(-60.0, 60.0)], lambda b: np.mod(b, 2 * PI)),
    "divergence": ([TURN] * 2, turn),
    "divergence_of_lines": ([METRES] * 8, lambda a, b, c, d, e, f, g, h: turn(bearing(c - a, d - b),
                                                                             bearing(g - e, h - f))),
    "bisected_bearing": ([TURN] * 2, lambda a, b: bearing(np.cos(a) + np.cos(b), np.sin(a) + np.sin(b))),
    "bearing_intersection": ([AROUND] * 4 + [TURN] * 2, rays_meet),
    "on_line": ([AROUND] * 6 + [(0.0, 5.0)], on_line),
    "lines_cross": ([AROUND] * 8, cross),
    "vector_distance": ([METRES] * 6, lambda a, b, c, d, e, f: np.sqrt((d - a) ** 2 + (e - b) ** 2 + (f - c) ** 2)),
    "vector_length": ([METRES] * 3, lambda x, y, z: np.sqrt(x * x + y * y + z * z)),
    "vector_bearing": ([METRES] * 2, lambda x, y: bearing(y, x)),
    "vector_slope_angle": ([METRES] * 3, lambda x, y, z: np.arctan2(z, np.hypot(x, y))),
    "vector_slope_angle_along_x": ([METRES] * 2, slope_along),
    "vector_slope_angle_along_y": ([METRES] * 2, slope_along),
    "arc_length": ([TURN, (-1e3, 1e3)], lambda angle, radius: angle * radius),
    "arc_angle": ([METRES, (-1e3, 1e3)], lambda length, radius: length / radius),
    "arc_half_chord": ([(0.0, 1e3)] * 2, lambda r, s: np.where(s < r, np.sqrt(abs(r * r - (r - s) ** 2)), 2 * r)),
    "spiral_deflection": ([(0.0, 300.0), (1e4, 1e6)], lambda length, constant: length ** 2 / constant),
    "spiral_deltas": ([(0.0, 200.0), (1e5, 1e6), (1e-9, 1e-8)], spiral),
    "follow": ([METRES] * 3 + [TURN, (0.0, 1e4), (-1.5, 1.5)],
               lambda n, e, h, b, d, a: follow(n, e, h, b, d, d * np.tan(a))),
    "follow_grade": ([METRES] * 3 + [TURN, (0.0, 1e4), (-2.0, 2.0)],
                     lambda n, e, h, b, d, g: follow(n, e, h, b, d, d * g)),
    "follow_height_change": ([METRES] * 3 + [TURN, (0.0, 1e4), (-50.0, 50.0)], follow),
    "first_face": ([TURN, (0.0, 6.2)], lambda h, v: [np.where(v > PI, np.mod(h + PI, 2 * PI), h),
                                                     np.where(v > PI, 2 * PI - v, v)]),
    "reduce_observation": ([TURN, (0.0, 3.1), (0.0, 1e3)] + [METRES] * 3 + [(-2.0, 2.0), (0.999, 1.001)],
                           reduce_observation),
    "calculate_observation": ([METRES] * 6 + [(1.0, 2.0)] * 2 + [(0.999, 1.001)], calculate_observation),
    "llh_to_xyz": ([LATITUDE, LONGITUDE, (-100.0, 9e3)], to_xyz),
    "xyz_to_llh": ([(3e6, 7e6), (-7e6, 7e6), (-7e6, 7e6)], to_llh),
    "xyz_to_local": ([(3e6, 7e6)] * 6, to_local),
    "curvature_radii": ([LATITUDE], radii),
    "llh_equal": ([(-1e-10, 1e-10)] * 2 + [NEAR] + [(-1e-10, 1e-10)] * 2 + [NEAR],
                  lambda a, b, c, d, e, f: (6335439.0 * (d - a)) ** 2 + (A * (e - b)) ** 2 + (f - c) ** 2 < .0005 ** 2),
    "covariance_to_llh": ([(3e6, 7e6)] * 3 + [(-1.0, 1.0)] * 6, covariance_to_llh),
    "covariance_to_neu": ([(3e6, 7e6)] * 3 + [(-1.0, 1.0)] * 6, covariance_to_neu),
    "great_circle_distance": ([LATITUDE, LONGITUDE] * 2, sphere_distance),
    "great_circle_bearing": ([LATITUDE, LONGITUDE] * 2, sphere_bearing),
    "date_to_mjd": ([(1858.0, 9999.0), (1.0, 13.0), (1.0, 29.0)], days),
    "mjd_to_gps": ([(44244.0, 80000.0), (0.0, 86400.0)],
                   lambda mjd, s: [(mjd - 44244) // 7, (mjd - 44244) % 7 * 86400 + s]),
    "gps_to_mjd": ([(0.0, 9000.0), (0.0, 604800.0)], lambda week, s: 44244 + 7 * week + s / 86400),
    "calendar_to_java_time": ([(1970.0, 9999.0), (1.0, 13.0), (1.0, 29.0), (0.0, 24.0), (0.0, 60.0), (0.0, 60.0),
                               (0.0, 1000.0)], lambda y, m, d, hour, minute, s, ms:
                              (days(y, m, d) - 40587) * 86400000 + ((hour * 60 + minute) * 60 + s) * 1000 + ms),
    "degrees_to_radians": ([(-720.0, 720.0)], np.deg2rad),
    "factorial": ([(0.0, 20.0)], lambda n: np.array([float(np.prod(np.arange(1, k + 1))) for k in n])),
    "dms_to_radians": ([(1.0, 360.0), (0.0, 60.0), (0.0, 60.0)], lambda d, m, s: np.deg2rad(d + m / 60 + s / 3600)),
    "feet_inches_to_metres": ([(0.0, 1e4), (0.0, 12.0), (0.0, 64.0), (64.0, 65.0)],
                              lambda feet, inches, n, d: FOOT * (feet + (inches + n / d) / 12)),
}
# arguments that are whole numbers
WHOLE = {"date_to_mjd": {0, 1, 2}, "mjd_to_gps": {0}, "gps_to_mjd": {0}, "calendar_to_java_time": set(range(7)),
         "factorial": {0}, "dms_to_radians": {0, 1}, "feet_inches_to_metres": {0, 2, 3}}
SIX_AT_ONCE = {"covariance_to_llh", "covariance_to_neu"}  # what follows the position is one argument


def columns(name, count, seed=1):
    """Random arguments for a function."""
    random = np.random.default_rng(seed)
    made = [random.uniform(least, greatest, count) for least, greatest in FUNCTIONS[name][0]]
    return [np.floor(column) if i in WHOLE.get(name, ()) else column for i, column in enumerate(made)]


def arguments(name, made):
    """The same columns as the package takes them."""
    if name in SIX_AT_ONCE:
        return [*made[:3], np.stack(made[3:], axis=-1)]
    return [column.astype(np.int64) if i in WHOLE.get(name, ()) else column for i, column in enumerate(made)]
