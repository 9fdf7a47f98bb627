#include "faces.h"

#include <cmath>

#include "angles.h"

namespace {

geo_hvd folded(geo_hvd obs) {
    return geo_normalise_obs(obs);
}

}  // namespace

geo_hvd mean_of_faces(const Sight& sight) {
    if (!sight.face1 || !sight.face2) {
        return folded(sight.face1 ? *sight.face1 : *sight.face2);
    }
    const geo_hvd a = *sight.face1;
    const geo_hvd b = folded(*sight.face2);
    return {geo_bisected_bearing(a.horizontal, b.horizontal), 0.5 * (a.vertical + b.vertical),
            0.5 * (a.distance + b.distance)};
}

FaceDifference face_difference(const Sight& sight) {
    const geo_hvd a = *sight.face1;
    const geo_hvd b = folded(*sight.face2);
    return {0.5 * std::remainder(a.horizontal - b.horizontal, 2.0 * PI), 0.5 * (a.vertical - b.vertical),
            a.distance - b.distance};
}
