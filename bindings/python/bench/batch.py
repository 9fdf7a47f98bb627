"""Batch calls at a million items beside plain NumPy, pyproj and shapely: milliseconds of each, the least of interleaved
rounds, and their ratio (above 1: this package is faster).
"""
import time

import numpy as np
import pyproj
import shapely
from shapely.geometry import Polygon

from plain_forms import FUNCTIONS, arguments, columns

from basalt import geo, time_scales, units

COUNT = 1_000_000
ROUNDS = 5
SLOW_IN_NUMPY = {"date_to_mjd", "calendar_to_java_time", "factorial", "spiral_deltas"}  # their plain forms loop


def milliseconds(work):
    start = time.perf_counter()
    work()
    return (time.perf_counter() - start) * 1e3


def compare(name, ours, theirs):
    pairs = [(milliseconds(ours), milliseconds(theirs)) for _ in range(ROUNDS)]
    mine, other = (min(column) for column in zip(*pairs))
    print(f"{name:44}{mine:10.2f}{other:10.2f}{other / mine:9.2f}", flush=True)


def main():
    print(f"{'':44}{'basalt, ms':>10}{'peer, ms':>10}{'ratio':>9}")
    for name, (_, plain) in FUNCTIONS.items():
        if name not in SLOW_IN_NUMPY:
            call = next(getattr(module, name) for module in (geo, time_scales, units) if hasattr(module, name))
            made = columns(name, COUNT)
            given = arguments(name, made)
            compare(f"{name} / NumPy", lambda: call(*given), lambda: plain(*made))

    latitude, longitude, height = columns("llh_to_xyz", COUNT)
    to_xyz = pyproj.Transformer.from_crs("EPSG:4979", "EPSG:4978")
    geod = pyproj.Geod(ellps="WGS84")
    x, y, z = geo.llh_to_xyz(latitude, longitude, height)
    compare("llh_to_xyz / pyproj", lambda: geo.llh_to_xyz(latitude, longitude, height),
            lambda: to_xyz.transform(latitude, longitude, height, radians=True))
    compare("xyz_to_llh / pyproj", lambda: geo.xyz_to_llh(x, y, z),
            lambda: to_xyz.transform(x, y, z, radians=True, direction="INVERSE"))
    distance = np.abs(height) * 100
    compare("direct / pyproj", lambda: geo.direct(latitude, longitude, latitude, distance),
            lambda: geod.fwd(longitude, latitude, latitude, distance, radians=True))

    ends = latitude[::-1], longitude[::-1]
    compare("geodesic_inverse / pyproj", lambda: geo.geodesic_inverse(latitude, longitude, *ends),
            lambda: geod.inv(longitude, latitude, *ends[::-1], radians=True))
    frame = geo.LocalFrame(0.8, 0.1, 300.0)
    to_local = pyproj.Transformer.from_pipeline(
        f"+proj=topocentric +ellps=WGS84 +lat_0={np.degrees(0.8)} +lon_0={np.degrees(0.1)} +h_0=300")
    compare("LocalFrame.xyz_to_local / pyproj", lambda: frame.xyz_to_local(x, y, z),
            lambda: to_local.transform(x, y, z))

    random = np.random.default_rng(3)
    turns = np.sort(random.uniform(0, 2 * np.pi, 100))
    norths, easts = 100 * np.cos(turns), 100 * np.sin(turns)
    north, east = random.uniform(-110, 110, (2, COUNT))
    outline = Polygon(np.stack([norths, easts], axis=1))
    if hasattr(shapely, "contains_xy"):
        shapely.prepare(outline)
        contains = shapely.contains_xy
    else:
        from shapely import vectorized
        contains = vectorized.contains
    prepared = geo.PreparedPolygon(norths, easts)
    for name, ours in (("in_polygon", lambda: geo.in_polygon(north, east, norths, easts)),
                       ("PreparedPolygon.contains", lambda: prepared.contains(north, east))):
        compare(f"{name}, 100 vertices / shapely", ours, lambda: contains(outline, north, east))


if __name__ == "__main__":
    main()
