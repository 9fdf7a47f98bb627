#include "basalt/geo/ellipsoid.h"
