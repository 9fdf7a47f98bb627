#!/usr/bin/env python3
"""A terrain from a grid file, a window of it, and its picture.

Usage: plot_terrain.py [GRID.asc [PICTURE.png]]
"""
import pathlib
import sys

import matplotlib
import numpy as np

from basalt import Sparse2DArray, geo

matplotlib.use("Agg")  # a picture and no window
from matplotlib import pyplot  # noqa: E402
from matplotlib.colors import LightSource  # noqa: E402

ROOT = pathlib.Path(__file__).resolve().parent.parent.parent.parent
grid_file = pathlib.Path(sys.argv[1]) if len(sys.argv) > 1 else ROOT / "examples" / "data" / "jacksboro.asc"
picture = sys.argv[2] if len(sys.argv) > 2 else "terrain.png"

# %% The grid: six lines that say where it lies, then heights, the northern row first.
with grid_file.open() as file:
    header = {key.lower(): float(value) for key, value in (file.readline().split() for _ in range(6))}
    heights = np.loadtxt(file)
rows, columns = heights.shape
cell = np.radians(header["cellsize"])
south, west = np.radians(header["yllcorner"]), np.radians(header["xllcorner"])

# %% The store: a record by cell, east and north of the south-western corner. No data, no record.
terrain = Sparse2DArray([("height", "f4"), ("slope", "f4")], block_side=32)
north, east = np.mgrid[rows - 1:-1:-1, 0:columns]
known = heights != header.get("nodata_value", -9999)

# How long a cell's sides are, on the ellipsoid at its middle latitude.
meridian, prime_vertical = geo.curvature_radii(south + (rows / 2) * cell)
side_north = meridian * cell
side_east = prime_vertical * np.cos(south + (rows / 2) * cell) * cell
fall_south, fall_east = np.gradient(np.where(known, heights, np.nan), side_north, side_east)

records = np.zeros(known.sum(), terrain.dtype)
records["height"] = heights[known]
records["slope"] = np.hypot(fall_south, fall_east)[known]
terrain.insert(east[known], north[known], records)
print(f"{len(records)} cells of {side_east:.1f} m by {side_north:.1f} m")

# %% A window: the middle half of the grid.
least, greatest = (columns // 4, rows // 4), (3 * columns // 4, 3 * rows // 4)
cells, found = terrain.window(least, greatest)
window = np.where(found, cells["height"], np.nan)
y, x = np.unravel_index(cells["slope"].argmax(), found.shape)
print(f"{found.sum()} cells in the window, {np.nanmin(window):.0f} to {np.nanmax(window):.0f} m, "
      f"steepest {cells['slope'][y, x]:.0%} at cell {x + least[0]}, {y + least[1]}")

# %% The picture: lit from the north-west, with contours every fifty metres.
extent = np.array([0, window.shape[1] * side_east, 0, window.shape[0] * side_north]) / 1000
light = LightSource(azdeg=315, altdeg=45)
shaded = light.shade(window, pyplot.get_cmap("gist_earth"), vert_exag=2, dx=side_east, dy=side_north,
                     blend_mode="soft", vmin=np.nanmin(window) - 100, vmax=np.nanmax(window))
figure, axes = pyplot.subplots(figsize=(9, 8), layout="constrained")
axes.imshow(shaded, origin="lower", extent=extent)
axes.contour(window, levels=np.arange(0, 3000, 50), colors="black", linewidths=0.3, extent=extent)
axes.set_xlabel("east, km")
axes.set_ylabel("north, km")
axes.set_title(grid_file.stem)
figure.savefig(picture, dpi=120)
print(f"wrote {picture}")
