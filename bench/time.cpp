// Dates and day counts beside std::chrono and the C library; angles and variances beside the formulas written
// out. Before a row is timed, its answers are compared with the library's.
#include <benchmark/benchmark.h>
#include <time.h>

#include <array>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <vector>

#include "basalt/geo.h"
#include "tests/geo/plain_forms.h"

namespace {

constexpr std::size_t COUNT = 1024;
constexpr std::chrono::sys_days MJD_0 = std::chrono::year(1858) / std::chrono::November / 17;
constexpr std::int64_t SECONDS_AT_MJD_0 = -3506716800;  // since 1970

/// Wide fields: results written as four short ones and read as a whole would wait for the store buffer.
struct Date {
    unsigned year, month, day, day_of_week;
    bool operator==(const Date&) const = default;
};

Date library_date(std::uint32_t mjd) {
    std::uint16_t year = 0;
    std::uint16_t month = 0;
    std::uint16_t day = 0;
    std::uint16_t day_of_week = 0;
    _mjd2greg(mjd, year, month, day, day_of_week);
    return {year, month, day, day_of_week};
}

Date chrono_date(std::uint32_t mjd) {
    const std::chrono::sys_days day = MJD_0 + std::chrono::days(mjd);
    const std::chrono::year_month_day date = day;
    return {static_cast<unsigned>(static_cast<int>(date.year())), static_cast<unsigned>(date.month()),
            static_cast<unsigned>(date.day()), std::chrono::weekday(day).c_encoding()};
}

Date gmtime_date(std::uint32_t mjd) {
    const time_t seconds = SECONDS_AT_MJD_0 + std::int64_t{86400} * mjd;
    tm fields = {};
    gmtime_r(&seconds, &fields);
    return {static_cast<unsigned>(fields.tm_year + 1900), static_cast<unsigned>(fields.tm_mon + 1),
            static_cast<unsigned>(fields.tm_mday), static_cast<unsigned>(fields.tm_wday)};
}

std::uint32_t library_mjd(const Date& date) {
    return _greg2mjd(static_cast<std::uint16_t>(date.year), static_cast<std::uint16_t>(date.month),
                     static_cast<std::uint16_t>(date.day));
}

std::uint32_t chrono_mjd(const Date& date) {
    const std::chrono::sys_days day = std::chrono::year(static_cast<int>(date.year)) / date.month / date.day;
    return static_cast<std::uint32_t>((day - MJD_0).count());
}

/// Times `ask` over the inputs, one a turn; `expected` is the library's own answer.
template <typename Input, typename Ask, typename Expected>
void run(benchmark::State& state, const std::vector<Input>& inputs, const Ask& ask,
         const Expected& expected) {
    for (const Input& input : inputs) {
        if (!(ask(input) == expected(input))) {
            state.SkipWithError("answers differ");
            return;
        }
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(ask(inputs[at]));
        at = (at + 1) % COUNT;
    }
}

std::vector<std::uint32_t> days() {
    plain::Random random(1);
    std::vector<std::uint32_t> result(COUNT);
    for (std::uint32_t& mjd : result) {
        mjd = static_cast<std::uint32_t>(random.real(0.0, 120000.0));
    }
    return result;
}

std::vector<Date> dates() {
    std::vector<Date> result;
    for (const std::uint32_t mjd : days()) {
        result.push_back(library_date(mjd));
    }
    return result;
}

template <typename Input, typename Ask, typename Expected>
void row(const char* name, std::vector<Input> inputs, Ask ask, Expected expected) {
    benchmark::RegisterBenchmark(name, [=](benchmark::State& state) { run(state, inputs, ask, expected); });
}

using Six = std::array<double, 6>;

struct Dms {
    long degrees, minutes;
    double seconds;
    bool operator==(const Dms&) const = default;
};

Dms library_dms(double radians) {
    int degrees = 0;
    int minutes = 0;
    double seconds = 0.0;
    _radtodms(radians, &degrees, &minutes, &seconds);
    return {degrees, minutes, seconds};
}

/// Out of line, as the library is to its callers.
[[gnu::noinline]] Dms plain_dms(double radians) {
    const double d = radians / 0.017453292519943295;
    double t = std::fabs(d) * 3600.0 + 5e-6;
    Dms result = {};
    result.degrees = static_cast<int>(t / 3600.0);
    t -= static_cast<double>(result.degrees) * 3600.0;
    result.minutes = static_cast<int>(t / 60.0);
    result.seconds = t - static_cast<double>(result.minutes) * 60.0 - 5e-6;
    result.degrees = d >= 0.0 ? result.degrees : -result.degrees;
    return result;
}

std::vector<double> angles() {
    plain::Random random(2);
    std::vector<double> result(COUNT);
    for (double& angle : result) {
        angle = random.real(-6.0, 6.0);
    }
    return result;
}

constexpr Six COVARIANCE = {2e-4, 3e-4, 5e-4, 1e-5, -4e-5, 2e-5};

std::vector<geo_vector> positions() {
    plain::Random random(3);
    std::vector<geo_vector> result(COUNT);
    for (geo_vector& position : result) {
        const geo_llh llh = {random.real(-1.5, 1.5), random.real(-3.1, 3.1), random.real(0.0, 5000.0)};
        _llh2xyz(&llh, &position);
    }
    return result;
}

Six library_variance(const geo_vector& position) {
    Six out = {};
    Varxyz2varneu(&position, COVARIANCE.data(), out.data());
    return out;
}

/// What the work cannot do without: the conversion of the position.
Six position_alone(const geo_vector& position) {
    geo_llh llh = {};
    _xyz2llh(&position, &llh, 5e-9);
    return {llh.latitude, llh.longitude, llh.height, 0.0, 0.0, 0.0};
}

}  // namespace

int main(int argc, char** argv) {
    row("date_to_mjd/basalt", dates(), library_mjd, library_mjd);
    row("date_to_mjd/std_chrono", dates(), chrono_mjd, library_mjd);
    row("mjd_to_date_and_weekday/basalt", days(), library_date, library_date);
    row("mjd_to_date_and_weekday/std_chrono", days(), chrono_date, library_date);
    row("mjd_to_date_and_weekday/gmtime_r", days(), gmtime_date, library_date);
    row("degrees_minutes_seconds/basalt", angles(), library_dms, library_dms);
    row("degrees_minutes_seconds/plain_form", angles(), plain_dms, library_dms);
    row("variance_north_east_up/basalt", positions(), library_variance, library_variance);
    row("variance_north_east_up/limit_position_alone", positions(), position_alone, position_alone);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
