/// @file
/// Constants of the elementary functions, written by fit.py.
// clang-format off
#ifndef BASALT_SRC_GEO_ELEMENTARY_COEFFICIENTS_H
#define BASALT_SRC_GEO_ELEMENTARY_COEFFICIENTS_H

#include <cstdint>

namespace basalt::geo::elementary {

/// sin x = x + x^3 S(x^2) for |x| <= 0.7854; relative error 2^-57.9.
inline constexpr double SINE[6] = {
    -0x1.5555555555548p-3,
    0x1.111111110f75ep-7,
    -0x1.a01a019bf261ap-13,
    0x1.71de355f532d9p-19,
    -0x1.ae5e54bee41d2p-26,
    0x1.5d8e4f7528e90p-33};
/// cos x = 1 - x^2 / 2 + x^4 C(x^2) for |x| <= 0.7854; relative error 2^-63.8.
inline constexpr double COSINE[6] = {
    0x1.555555555554ap-5,
    -0x1.6c16c16c14e4bp-10,
    0x1.a01a019c68c7fp-16,
    -0x1.27e4f7d92820ep-22,
    0x1.1ee9ccea27139p-29,
    -0x1.8f9f7ef361c8dp-37};
/// atan x = x + x^3 A(x^2) for |x| <= 0.2501; relative error 2^-63.7.
inline constexpr double ARCTANGENT[9] = {
    -0x1.5555555555553p-2,
    0x1.9999999998dabp-3,
    -0x1.24924923eb718p-3,
    0x1.c71c713877d8dp-4,
    -0x1.745cf4c695680p-4,
    0x1.3b0ea4b74481ap-4,
    -0x1.109bf93486e2cp-4,
    0x1.d4f6d1ff96f8fp-5,
    -0x1.479cacedfd798p-5};
/// pi/2 in three parts; products of the first two with integers up to 2^16 are exact. What Cody and Waite's
/// reduction leaves of the doubles nearest to the first 2^16 multiples has relative errors to 2^-63.1.
inline constexpr double HALF_PI_PARTS[3] = {
    0x1.921fb54440000p+0,
    0x1.68c234c4c0000p-39,
    0x1.98a2e03707345p-77};
/// pi/2 in two parts.
inline constexpr double HALF_PI_SUM[2] = {
    0x1.921fb54442d18p+0,
    0x1.1a62633145c07p-54};
inline constexpr double TWO_OVER_PI = 0x1.45f306dc9c883p-1;
/// 2/pi as a fixed-point number: two words of 0, then 32 bits a word after the binary point.
inline constexpr std::uint32_t TWO_OVER_PI_WORDS[40] = {
    0x00000000, 0x00000000, 0xa2f9836e, 0x4e441529, 0xfc2757d1, 0xf534ddc0, 0xdb629599, 0x3c439041,
    0xfe5163ab, 0xdebbc561, 0xb7246e3a, 0x424dd2e0, 0x06492eea, 0x09d1921c, 0xfe1deb1c, 0xb129a73e,
    0xe88235f5, 0x2ebb4484, 0xe99c7026, 0xb45f7e41, 0x3991d639, 0x835339f4, 0x9c845f8b, 0xbdf9283b,
    0x1ff897ff, 0xde05980f, 0xef2f118b, 0x5a0a6d1f, 0x6d367ecf, 0x27cb09b7, 0x4f463f66, 0x9e5fea2d,
    0x7527bac7, 0xebe5f17b, 0x3d0739f7, 0x8a5292ea, 0x6bfb5fb1, 0x1f8d5d08, 0x56033046, 0xfc7b6bab};
/// Angles of the centres, in two parts: of slope 0, 1/2 and 1; + 3 beyond the diagonal, + 6 for a negative x.
inline constexpr double CENTRE_ANGLES[24] = {
    0x0.0p+0, 0x0.0p+0,
    0x1.dac670561bb4fp-2, 0x1.a2b7f222f65e2p-56,
    0x1.921fb54442d18p-1, 0x1.1a62633145c07p-55,
    0x1.921fb54442d18p+0, 0x1.1a62633145c07p-54,
    0x1.1b6e192ebbe44p+0, 0x1.b1b466a88828ep-54,
    0x1.921fb54442d18p-1, 0x1.1a62633145c07p-55,
    0x1.921fb54442d18p+1, 0x1.1a62633145c07p-53,
    0x1.56c6e7397f5aep+1, 0x1.660b64ece6f4bp-53,
    0x1.2d97c7f3321d2p+1, 0x1.a79394c9e8a0ap-54,
    0x1.921fb54442d18p+0, 0x1.1a62633145c07p-54,
    0x1.0468a8ace4df6p+1, 0x1.0620bf7406affp-55,
    0x1.2d97c7f3321d2p+1, 0x1.a79394c9e8a0ap-54};

}  // namespace basalt::geo::elementary

#endif
