#!/usr/bin/env python3
"""Computes the constants of the elementary functions and the error that each polynomial reaches.

Usage: fit.py > src/geo/elementary/coefficients.h
       fit.py --rows > tests/data/elementary.csv       results at hard arguments, for the tests

Each polynomial is a least-squares fit of the relative error at Chebyshev nodes. Coefficients are rounded to double one
by one from the constant on, and the rest is fitted again to make up for the rounding.
"""
import math
import random
import sys

import mpmath
from mpmath import mpf

mpmath.mp.prec = 1400  # bits; 2/pi alone takes 1200
SAMPLES = 2000


def rounded(value, bits=53):
    """The value rounded to `bits` significant bits."""
    with mpmath.workprec(bits):
        return +mpf(value)


def fit(function, weight, count, top):
    """Coefficients, constant first, of a polynomial of z in (0, top] whose weighted error is small."""
    nodes = [top / 2 * (1 + mpmath.cos(mpmath.pi * (2 * i + 1) / (8 * count))) for i in range(4 * count)]
    coefficients = []
    for first in range(count):  # least squares for the coefficients from `first` on
        powers = mpmath.matrix(len(nodes), count - first)
        rest = mpmath.matrix(len(nodes), 1)
        for row, z in enumerate(nodes):
            rest[row] = weight(z) * (function(z) - mpmath.polyval(coefficients[::-1] or [0], z))
            for column in range(count - first):
                powers[row, column] = weight(z) * z ** (first + column)
        coefficients.append(rounded(mpmath.lu_solve(powers, rest)[0]))
    return coefficients


def polynomial(name, comment, count, reach, remainder, power, result):
    """Prints a fit of result(x), made of the leading terms of its series and x^power times the polynomial."""
    def function(z):
        return remainder(mpmath.sqrt(z)) / mpmath.sqrt(z) ** power

    def weight(z):
        return mpmath.sqrt(z) ** power / result(mpmath.sqrt(z))

    with mpmath.workprec(250):
        top = mpf(reach) ** 2
        c = fit(function, weight, count, top)
        zs = [top * i / SAMPLES for i in range(1, SAMPLES + 1)]
        worst = max(abs(weight(z) * (mpmath.polyval(c[::-1], z) - function(z))) for z in zs)
    print(f"/// {comment} for |x| <= {reach}; relative error 2^{float(mpmath.log(worst, 2)):.1f}.")
    table(name, c)


def table(name, values):
    print(f"inline constexpr double {name}[{len(values)}] = {{")
    print(",\n".join(f"    {float(v).hex()}" for v in values) + "};")


def parts(value, widths):
    """Numbers of the given widths in bits whose sum is the value."""
    result = []
    for width in widths:
        result.append(rounded(value, width))
        value -= result[-1]
    return result


def reduction(half_pi):
    """Logarithm to base 2 of the largest error of the reduction to |x| <= pi/4, at the doubles where it is hardest."""
    worst = mpf(0)
    with mpmath.workprec(250):
        for n in range(1, 2 ** 16 + 1):
            x = float(n * mpmath.pi / 2)
            rest = x - n * float(half_pi[0])
            second = n * float(half_pi[1])
            high = rest - second
            low = (rest - high - second) - n * float(half_pi[2])
            worst = max(worst, abs((mpf(high) + low) / (x - n * mpmath.pi / 2) - 1))
        return float(mpmath.log(worst, 2))


def rows():
    """Angles nearest to multiples of pi/2 and pi/4, of all sizes; slopes nearest to where the centre changes."""
    half_pi = mpmath.pi / 2
    by_distance = sorted(range(1, 2 ** 16 + 3), key=lambda n: abs(float(n * half_pi) - n * half_pi))
    angles = [float(n * half_pi) for n in by_distance[:40] + list(range(1, 9)) + [2 ** 16 - 1, 2 ** 16, 2 ** 16 + 1]]
    angles += [float(n * half_pi / 2) for n in range(1, 40, 2)]
    angles += [102943.0, math.nextafter(102943.0, math.inf), 1e22, sys.float_info.max, 2.0 ** -27, 2.0 ** -26, 1e-300]
    angles += [float.fromhex("0x1.6ac5b262ca1ffp+849")]  # the double nearest to a multiple of pi/2
    draw = random.Random(1)
    angles += [draw.uniform(1, 2) * 2.0 ** draw.randrange(-20, 1023) for _ in range(60)]
    slopes = [0.0, 2.0 ** -80, 0.25, 0.2426, 0.5, 0.7675, 1.0, 1.3, 4.0, 2.0 ** 90]
    print(f"# Made by fit.py with mpmath {mpmath.__version__}.")
    print("# Columns: angle a (radians) or y, x, sin a, cos a, tan a, atan a, atan2(y, x).")
    for i, a in enumerate(angles):
        x = float((-1) ** i * mpf(a) * slopes[i % len(slopes)])
        x = math.nextafter(x, draw.choice((-math.inf, 0.0, math.inf))) if abs(x) < sys.float_info.max else 1.0
        values = mpf(a), mpf(x), mpmath.sin(a), mpmath.cos(a), mpmath.tan(a), mpmath.atan(a), mpmath.atan2(a, x)
        print(",".join(mpmath.nstr(v, 25) for v in values))


def main():
    print("/// @file\n/// Constants of the elementary functions, written by fit.py.\n// clang-format off")
    print("#ifndef BASALT_SRC_GEO_ELEMENTARY_COEFFICIENTS_H\n#define BASALT_SRC_GEO_ELEMENTARY_COEFFICIENTS_H\n")
    print("#include <cstdint>\n\nnamespace basalt::geo::elementary {\n")
    polynomial("SINE", "sin x = x + x^3 S(x^2)", 6, "0.7854", lambda x: mpmath.sin(x) - x, 3, mpmath.sin)
    polynomial("COSINE", "cos x = 1 - x^2 / 2 + x^4 C(x^2)", 6, "0.7854", lambda x: mpmath.cos(x) - 1 + x * x / 2, 4,
               mpmath.cos)
    polynomial("ARCTANGENT", "atan x = x + x^3 A(x^2)", 9, "0.2501", lambda x: mpmath.atan(x) - x, 3, mpmath.atan)

    half_pi = parts(mpmath.pi / 2, (37, 37, 53))
    print("/// pi/2 in three parts; products of the first two with integers up to 2^16 are exact. What Cody and Waite's")
    print(f"/// reduction leaves of the doubles nearest to the first 2^16 multiples has relative errors to 2^{reduction(half_pi):.1f}.")
    table("HALF_PI_PARTS", half_pi)
    print("/// pi/2 in two parts.")
    table("HALF_PI_SUM", parts(mpmath.pi / 2, (53, 53)))
    print(f"inline constexpr double TWO_OVER_PI = {float(rounded(2 / mpmath.pi)).hex()};")

    print("/// 2/pi as a fixed-point number: two words of 0, then 32 bits a word after the binary point.")
    count = 40
    digits = int(mpmath.floor(2 / mpmath.pi * mpf(2) ** (32 * (count - 2))))
    words = [(digits >> (32 * (count - 1 - i))) & 0xFFFFFFFF for i in range(count)]
    print(f"inline constexpr std::uint32_t TWO_OVER_PI_WORDS[{count}] = {{")
    print(",\n".join("    " + ", ".join(f"0x{w:08x}" for w in words[i:i + 8]) for i in range(0, count, 8)) + "};")

    print("/// Angles of the centres, in two parts: of slope 0, 1/2 and 1; + 3 beyond the diagonal, + 6 for a negative x.")
    print("inline constexpr double CENTRE_ANGLES[24] = {")
    angles = []
    for base, sign in ((0, 1), (mpmath.pi / 2, -1), (mpmath.pi, -1), (mpmath.pi / 2, 1)):
        for slope in (mpf(0), mpf(1) / 2, mpf(1)):
            high, low = parts(base + sign * mpmath.atan(slope), (53, 53))
            angles.append(f"    {float(high).hex()}, {float(low).hex()}")
    print(",\n".join(angles) + "};")
    print("\n}  // namespace basalt::geo::elementary\n\n#endif")


if __name__ == "__main__":
    rows() if sys.argv[1:] == ["--rows"] else main()
