// Dates and day counts compared with std::chrono and the C library; angles and variances with plain formulas.
// Results are compared before anything is timed. Peers are called by functions with the library's arguments.
#include <benchmark/benchmark.h>
#include <time.h>

#include <array>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <vector>

#include "basalt/geo.h"
#include "bench/out_of_sight.h"
#include "tests/geo/plain_forms.h"

namespace {

constexpr std::size_t COUNT = 1024;
constexpr std::chrono::sys_days MJD_0 = std::chrono::year(1858) / std::chrono::November / 17;
constexpr std::int64_t SECONDS_AT_MJD_0 = -3506716800;  // since 1970

/// Wide fields: a wide read of four short stores would stall.
struct Date {
    unsigned year, month, day, day_of_week;
    bool operator==(const Date&) const = default;
};

using Whole = std::uint16_t;

void chrono_date(std::uint32_t mjd, Whole& year, Whole& month, Whole& day, Whole& day_of_week) {
    const std::chrono::sys_days days = MJD_0 + std::chrono::days(mjd);
    const std::chrono::year_month_day date = days;
    year = static_cast<Whole>(static_cast<int>(date.year()));
    month = static_cast<Whole>(static_cast<unsigned>(date.month()));
    day = static_cast<Whole>(static_cast<unsigned>(date.day()));
    day_of_week = static_cast<Whole>(std::chrono::weekday(days).c_encoding());
}

void gmtime_date(std::uint32_t mjd, Whole& year, Whole& month, Whole& day, Whole& day_of_week) {
    const time_t seconds = SECONDS_AT_MJD_0 + std::int64_t{86400} * mjd;
    tm fields = {};
    gmtime_r(&seconds, &fields);
    year = static_cast<Whole>(fields.tm_year + 1900);
    month = static_cast<Whole>(fields.tm_mon + 1);
    day = static_cast<Whole>(fields.tm_mday);
    day_of_week = static_cast<Whole>(fields.tm_wday);
}

std::uint32_t chrono_mjd(Whole year, Whole month, Whole day) {
    const std::chrono::sys_days days = std::chrono::year(year) / month / day;
    return static_cast<std::uint32_t>((days - MJD_0).count());
}

auto date_by(decltype(_mjd2greg)* convert) {
    return [convert = bench::out_of_sight(convert)](std::uint32_t mjd) -> Date {
        Whole year = 0;
        Whole month = 0;
        Whole day = 0;
        Whole day_of_week = 0;
        convert(mjd, year, month, day, day_of_week);
        return {year, month, day, day_of_week};
    };
}

auto mjd_by(decltype(_greg2mjd)* convert) {
    return [convert = bench::out_of_sight(convert)](const Date& date) {
        return convert(static_cast<Whole>(date.year), static_cast<Whole>(date.month),
                       static_cast<Whole>(date.day));
    };
}

/// Times `call` over the inputs; `expected` returns the library's result.
template <typename Input, typename Call, typename Expected>
void run(benchmark::State& state, const std::vector<Input>& inputs, const Call& call,
         const Expected& expected) {
    for (const Input& input : inputs) {
        if (!(call(input) == expected(input))) {
            state.SkipWithError("results differ");
            return;
        }
    }
    std::size_t at = 0;
    for ([[maybe_unused]] auto _ : state) {
        benchmark::DoNotOptimize(call(inputs[at]));
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
        result.push_back(date_by(_mjd2greg)(mjd));
    }
    return result;
}

template <typename Input, typename Call, typename Expected>
void row(const char* name, std::vector<Input> inputs, Call call, Expected expected) {
    benchmark::RegisterBenchmark(name, [=](benchmark::State& state) { run(state, inputs, call, expected); });
}

using Six = std::array<double, 6>;

struct Dms {
    long degrees, minutes;
    double seconds;
    bool operator==(const Dms&) const = default;
};

void plain_dms(double radians, int* degrees, int* minutes, double* seconds) {
    const double d = radians / 0.017453292519943295;
    double t = std::fabs(d) * 3600.0 + 5e-6;
    *degrees = static_cast<int>(t / 3600.0);
    t -= static_cast<double>(*degrees) * 3600.0;
    *minutes = static_cast<int>(t / 60.0);
    *seconds = t - static_cast<double>(*minutes) * 60.0 - 5e-6;
    *degrees = d >= 0.0 ? *degrees : -*degrees;
}

auto dms_by(decltype(_radtodms)* convert) {
    return [convert = bench::out_of_sight(convert)](double radians) -> Dms {
        int degrees = 0;
        int minutes = 0;
        double seconds = 0.0;
        convert(radians, &degrees, &minutes, &seconds);
        return {degrees, minutes, seconds};
    };
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

/// The least work: the conversion of the position, its sines and cosines.
Six position_and_sines(const geo_vector& position) {
    geo_llh llh = {};
    _xyz2llh(&position, &llh, 5e-9);
    return {std::sin(llh.latitude),  std::cos(llh.latitude),  llh.height,
            std::sin(llh.longitude), std::cos(llh.longitude), 0.0};
}

}  // namespace

int main(int argc, char** argv) {
    row("date_to_mjd/basalt", dates(), mjd_by(_greg2mjd), mjd_by(_greg2mjd));
    row("date_to_mjd/std_chrono", dates(), mjd_by(chrono_mjd), mjd_by(_greg2mjd));
    row("mjd_to_date_and_weekday/basalt", days(), date_by(_mjd2greg), date_by(_mjd2greg));
    row("mjd_to_date_and_weekday/std_chrono", days(), date_by(chrono_date), date_by(_mjd2greg));
    row("mjd_to_date_and_weekday/gmtime_r", days(), date_by(gmtime_date), date_by(_mjd2greg));
    row("degrees_minutes_seconds/basalt", angles(), dms_by(_radtodms), dms_by(_radtodms));
    row("degrees_minutes_seconds/plain_form", angles(), dms_by(plain_dms), dms_by(_radtodms));
    row("variance_north_east_up/basalt", positions(), library_variance, library_variance);
    row("variance_north_east_up/limit_position_sines_and_cosines", positions(), position_and_sines,
        position_and_sines);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
