#include "basalt/geo/geodesic.h"
