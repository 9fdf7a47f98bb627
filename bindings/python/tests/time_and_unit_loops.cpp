// Time scales, angle and length units.
#include "loops.h"

#include <cstdint>

namespace {

std::uint16_t word(In in, int column, std::size_t i) {
    return static_cast<std::uint16_t>(in[column][i]);
}

int integer(In in, int column, std::size_t i) {
    return static_cast<int>(in[column][i]);
}

const Named LOOPS[] = {
    {"date_to_mjd", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = _greg2mjd(word(in, 0, i), word(in, 1, i), word(in, 2, i));
     })},
    {"mjd_to_date", loop_of([](std::size_t i, In in, Out out) {
         std::uint16_t year = 0, month = 0, day = 0, weekday = 0;
         _mjd2greg(static_cast<std::uint32_t>(in[0][i]), year, month, day, weekday);
         out[0][i] = year;
         out[1][i] = month;
         out[2][i] = day;
         out[3][i] = weekday;
     })},
    {"mjd_to_gps", loop_of([](std::size_t i, In in, Out out) {
         std::uint16_t week = 0;
         _mjd2gps(static_cast<std::uint32_t>(in[0][i]), in[1][i], week, out[1][i]);
         out[0][i] = week;
     })},
    {"gps_to_mjd",
     loop_of([](std::size_t i, In in, Out out) { out[0][i] = _gps2mjd(word(in, 0, i), in[1][i]); })},
    {"calendar_to_java_time", loop_of([](std::size_t i, In in, Out out) {
         SYSTEMTIME t{word(in, 0, i), word(in, 1, i), 0, word(in, 2, i), word(in, 3, i), word(in, 4, i),
                      word(in, 5, i), word(in, 6, i)};
         out[0][i] = static_cast<double>(_systime2javatime(&t));
     })},
    {"java_time_to_calendar", loop_of([](std::size_t i, In in, Out out) {
         SYSTEMTIME t{};
         _javatime2systemtime(static_cast<std::uint64_t>(in[0][i]), &t);
         out[0][i] = t.wYear;
         out[1][i] = t.wMonth;
         out[2][i] = t.wDay;
         out[3][i] = t.wHour;
         out[4][i] = t.wMinute;
         out[5][i] = t.wSecond;
         out[6][i] = t.wMilliseconds;
         out[7][i] = t.wDayOfWeek;
     })},
    {"degrees_to_radians", loop_of([](std::size_t i, In in, Out out) { out[0][i] = _degtorad(in[0][i]); })},
    {"factorial", loop_of([](std::size_t i, In in, Out out) {
         out[0][i] = factorial(static_cast<std::uint32_t>(in[0][i]));
     })},
    {"radians_to_dms", loop_of([](std::size_t i, In in, Out out) {
         int degrees = 0, minutes = 0;
         _radtodms(in[0][i], &degrees, &minutes, &out[2][i]);
         out[0][i] = degrees;
         out[1][i] = minutes;
     })},
    {"dms_to_radians", loop_of([](std::size_t i, In in, Out out) {
         _dmstorad(integer(in, 0, i), integer(in, 1, i), in[2][i], &out[0][i]);
     })},
    {"metres_to_feet_inches", loop_of([](std::size_t i, In in, Out out) {
         bool positive = false;
         int feet = 0, numerator = 0, denominator = 0;
         _mtoftin(in[0][i], integer(in, 1, i), &positive, &feet, &out[2][i], &numerator, &denominator);
         out[0][i] = positive ? 1 : 0;
         out[1][i] = feet;
         out[3][i] = numerator;
         out[4][i] = denominator;
     })},
    {"feet_inches_to_metres", loop_of([](std::size_t i, In in, Out out) {
         _ftintom(integer(in, 0, i), in[1][i], integer(in, 2, i), integer(in, 3, i), &out[0][i]);
     })},
};

}  // namespace

Loop time_and_unit_loop(const char* name) {
    return loop_named(LOOPS, name);
}
