#include "basalt/geo/variance.h"
