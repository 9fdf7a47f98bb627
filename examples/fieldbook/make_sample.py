#!/usr/bin/env python3
"""Makes the sample field book and alignment: true points, observed without error, then with the errors below.

Usage: make_sample.py DIRECTORY     writes fieldbook.csv, axis.csv and fieldbook_truth.csv (the true points)
"""
import math
import sys

CONTROL = {"K1": (5000.0, 2000.0, 100.0), "K2": (5312.5, 1804.25, 112.3),
           "K3": (5110.0, 2560.0, 96.4), "K4": (4896.75, 2731.5, 91.85)}
NEW = {"T1": (5048.0, 2136.0, 103.25), "T2": (5138.0, 2256.0, 98.6), "T3": (5086.0, 2404.0, 101.95)}
SIDES = {"K1": {"P1": (5061.2, 2018.4, 101.33)}, "T2": {"P2": (5171.45, 2301.1, 97.02), "P3": (5102.9, 2233.75, 99.4)},
         "K3": {"P4": (5144.6, 2588.8, 95.15)}}
POINTS = {**CONTROL, **NEW}
ROUTE = ["K2", "K1", "T1", "T2", "T3", "K3", "K4"]  # the first and the last are only sighted
HEIGHTS = {"K1": 1.562, "T1": 1.487, "T2": 1.605, "T3": 1.534, "K3": 1.578}
CIRCLE = {"K1": 0.0, "T1": 41.37, "T2": 203.9, "T3": 117.25, "K3": 355.11}  # degrees at grid north
ONE_FACE = {"P3"}
SECOND = math.pi / 648000

COLLIMATION, INDEX = 4.0 * SECOND, -6.0 * SECOND  # of the instrument, on every reading
ANGLE = 2.0 * SECOND                              # on each angle to a fore sight: 10 seconds in five angles
DISTANCE = 0.03                                   # on both sights of the leg T1-T2, which runs 3 north to 4 east
TARGET = 0.012                                    # the fore sight's target at T2 is booked so much too low


def dms(angle):
    units = round(angle % (2 * math.pi) / SECOND * 100) % (1296000 * 100)
    return f"{units // 360000}-{units // 6000 % 60:02d}-{units % 6000 // 100:02d}.{units % 100:02d}"


def sight(kind, station, name, target, height):
    north, east, rise = (b - a for a, b in zip(POINTS[station], target))
    rise += height - HEIGHTS[station]
    run = math.hypot(north, east) + (DISTANCE if {station, name} == {"T1", "T2"} else 0.0)
    horizontal = math.atan2(east, north) - math.radians(CIRCLE[station]) + (ANGLE if kind == "fore" else 0.0)
    zenith, slope = math.atan2(run, rise), math.hypot(run, rise)
    booked = height - TARGET if (kind, station) == ("fore", "T2") else height
    faces = [(1, horizontal + COLLIMATION, zenith + INDEX),
             (2, horizontal + math.pi - COLLIMATION, 2 * math.pi - zenith + INDEX)]
    return [f"{kind},{name},{booked:.3f},{dms(h)},{dms(z)},{slope:.4f},{face}"
            for face, h, z in faces if face == 1 or name not in ONE_FACE]


def field_book():
    lines = ["# A traverse from K1 to K3 with known errors; angles in degrees, minutes and seconds, lengths in metres.",
             "# point,NAME,NORTH,EAST,ELEVATION"]
    lines += [f"point,{name},{n:.3f},{e:.3f},{h:.3f}" for name, (n, e, h) in CONTROL.items()]
    lines += ["# station,NAME,INSTRUMENT_HEIGHT",
              "# back|fore|side,NAME,TARGET_HEIGHT,HORIZONTAL,ZENITH,SLOPE_DISTANCE,FACE"]
    for back, name, fore in zip(ROUTE, ROUTE[1:], ROUTE[2:]):
        lines.append(f"station,{name},{HEIGHTS[name]:.3f}")
        lines += sight("back", name, back, POINTS[back], 1.6) + sight("fore", name, fore, POINTS[fore], 1.55)
        for side, at in SIDES.get(name, {}).items():
            lines += sight("side", name, side, at, 2.0)
    return lines


def follow(pose, length, curvature, steps=20000):
    """North, east and bearing after a length of a curve, by the midpoint rule; curvature at a part of the length."""
    north, east, bearing = pose
    for i in range(steps):
        turn = curvature((i + 0.5) / steps) * length / steps
        north += math.cos(bearing + 0.5 * turn) * length / steps
        east += math.sin(bearing + 0.5 * turn) * length / steps
        bearing += turn
    return north, east, bearing


def alignment():
    pose = (5030.0, 2030.0, math.radians(48.5))
    for length, curvature in ((95, lambda part: 0), (60, lambda part: part / 180), (120, lambda part: 1 / 180),
                              (60, lambda part: (1 - part) / 180), (110, lambda part: 0)):
        pose = follow(pose, length, curvature)
    return ["# An axis through the traverse. The end is stated 9 mm too far south and 12 mm too far west.",
            "# start,CHAINAGE,NORTH,EAST,ELEVATION,BEARING,GRADE", "start,1005,5030,2030,101.2,48-30-00,-0.004",
            "straight,95", "spiral_in,60,180,right", "arc,120,180,right", "spiral_out,60,180,right", "straight,110",
            "# end,NORTH,EAST,BEARING", f"end,{pose[0] - 0.009:.4f},{pose[1] - 0.012:.4f},{dms(pose[2])}"]


def truth():
    sides = {name: at for side in SIDES.values() for name, at in side.items()}
    return ["name,north,east,elevation"] + [f"{name},{n:.4f},{e:.4f},{h:.4f}"
                                            for name, (n, e, h) in {**POINTS, **sides}.items()]


if len(sys.argv) != 2 or sys.argv[1].startswith("-"):
    sys.exit(__doc__)
for file_name, text in (("fieldbook", field_book()), ("axis", alignment()), ("fieldbook_truth", truth())):
    with open(f"{sys.argv[1]}/{file_name}.csv", "w", encoding="ascii", newline="\n") as file:
        file.write("\n".join(text) + "\n")
