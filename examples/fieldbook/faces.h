// Mean of the two faces of an instrument.
#ifndef FIELDBOOK_FACES_H
#define FIELDBOOK_FACES_H

#include <basalt/geo.h>

#include "book_reader.h"

/// A sight as if read on face 1 of an instrument without error, when both faces were read; else as the one
/// face has it.
geo_hvd mean_of_faces(const Sight& sight);

/// Instrument errors and reading spread from the two faces of one sight.
struct FaceDifference {
    double collimation;  ///< half the difference of the horizontal readings, face 1 less face 2, radians
    double index;        ///< half of what the zenith readings lack to or exceed 360 degrees, radians
    double distance;     ///< face 1 less face 2, metres
};

/// Only for a sight with both faces.
FaceDifference face_difference(const Sight& sight);

#endif
