#include "basalt/geo/units.h"
