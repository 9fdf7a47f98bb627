#include "basalt/geo/time_scales.h"
