#!/usr/bin/env python3
"""Makes the sample field book and alignment: true points, observed without error, then with the errors below.

Usage: make_sample.py DIRECTORY     writes fieldbook.csv, axis.csv and fieldbook_truth.csv (the true points)
"""
import math
import sys

CONTROL = {"K1": (5000.0, 2000.0, 100.0), "K2": (5312.5, 1804.25, 112.3),
           "K3": (5110.0, 2560.0, 96.4), "K4": (4896.75, 2731.5, 91.85)}
STATIONS = {"K1": (5000.0, 2000.0, 100.0), "T1": (5048.0, 2136.0, 103.25), "T2": (5138.0, 2256.0, 98.6),
            "T3": (5086.0, 2404.0, 101.95), "K3": (5110.0, 2560.0, 96.4)}
HEIGHTS = {"K1": 1.562, "T1": 1.487, "T2": 1.605, "T3": 1.534, "K3": 1.578}
CIRCLE = {"K1": 0.0, "T1": 41.37, "T2": 203.9, "T3": 117.25, "K3": 355.11}  # degrees at grid north
SIDES = {"K1": {"P1": (5061.2, 2018.4, 101.33)}, "T2": {"P2": (5171.45, 2301.1, 97.02), "P3": (5102.9, 2233.75, 99.4)},
         "K3": {"P4": (5144.6, 2588.8, 95.15)}}
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
    at = STATIONS[station]
    north, east = target[0] - at[0], target[1] - at[1]
    rise = target[2] + height - at[2] - HEIGHTS[station]
    run = math.hypot(north, east)
    if {station, name} == {"T1", "T2"}:
        run += DISTANCE
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
    route = list(STATIONS)
    for i, name in enumerate(route):
        back = "K2" if i == 0 else route[i - 1]
        fore = "K4" if i + 1 == len(route) else route[i + 1]
        lines.append(f"station,{name},{HEIGHTS[name]:.3f}")
        lines += sight("back", name, back, {**CONTROL, **STATIONS}[back], 1.6)
        lines += sight("fore", name, fore, {**CONTROL, **STATIONS}[fore], 1.55)
        for side, at in SIDES.get(name, {}).items():
            lines += sight("side", name, side, at, 2.0)
    return lines


def integrate(curvature, length, pose, steps=2000):
    """North, east and bearing after a length of a curve, by Simpson's rule on its turning tangent."""
    north, east, bearing = pose
    turn = [bearing]
    step = length / steps
    for i in range(steps):  # curvature is linear in length, so the trapezium is exact
        turn.append(turn[-1] + 0.5 * step * (curvature(i * step) + curvature((i + 1) * step)))
    weight = [1 if i in (0, steps) else 4 if i % 2 else 2 for i in range(steps + 1)]
    north += step / 3 * sum(w * math.cos(t) for w, t in zip(weight, turn))
    east += step / 3 * sum(w * math.sin(t) for w, t in zip(weight, turn))
    return north, east, turn[-1]


def alignment():
    radius, spiral, arc = 180.0, 60.0, 120.0
    pose = (5030.0, 2030.0, math.radians(48.5))
    pose = integrate(lambda l: 0.0, 95.0, pose)
    pose = integrate(lambda l: l / (radius * spiral), spiral, pose)
    pose = integrate(lambda l: 1 / radius, arc, pose)
    pose = integrate(lambda l: (spiral - l) / (radius * spiral), spiral, pose)
    north, east, bearing = integrate(lambda l: 0.0, 110.0, pose)
    return ["# An axis through the traverse. The end is stated 9 mm too far south and 12 mm too far west.",
            "# start,CHAINAGE,NORTH,EAST,ELEVATION,BEARING,GRADE", "start,1005,5030,2030,101.2,48-30-00,-0.004",
            "straight,95", f"spiral_in,{spiral:g},{radius:g},right", f"arc,{arc:g},{radius:g},right",
            f"spiral_out,{spiral:g},{radius:g},right", "straight,110", "# end,NORTH,EAST,BEARING",
            f"end,{north - 0.009:.4f},{east - 0.012:.4f},{dms(bearing)}"]


def truth():
    points = {**CONTROL, **STATIONS, **{k: v for side in SIDES.values() for k, v in side.items()}}
    return ["name,north,east,elevation"] + [f"{k},{n:.4f},{e:.4f},{h:.4f}" for k, (n, e, h) in points.items()]


def main():
    if len(sys.argv) != 2 or sys.argv[1].startswith("-"):
        sys.exit(__doc__)
    for name, lines in (("fieldbook", field_book()), ("axis", alignment()), ("fieldbook_truth", truth())):
        with open(f"{sys.argv[1]}/{name}.csv", "w", encoding="ascii", newline="\n") as file:
            file.write("\n".join(lines) + "\n")


if __name__ == "__main__":
    main()
