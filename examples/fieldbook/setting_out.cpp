#include "setting_out.h"

SettingOut set_out(const Book& book, const Traverse& traverse, const geo_nee& point, double target_height,
                   double scale) {
    SettingOut result = {};
    for (std::size_t i = 1; i < traverse.stations.size(); ++i) {
        if (geo_horz_distSq(traverse.stations[i].at, point) <
            geo_horz_distSq(traverse.stations[result.setup].at, point)) {
            result.setup = i;
        }
    }
    // The field is larger than the grid by the reciprocal of the scale.
    geo_calc_obs(traverse.stations[result.setup].at, book.setups[result.setup].height, point, target_height,
                 result.observation, 1.0 / scale);
    result.turn = geo_normalised_bearing(result.observation.horizontal - traverse.back_bearing[result.setup]);
    return result;
}
