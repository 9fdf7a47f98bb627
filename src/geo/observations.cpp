#include "basalt/geo/observations.h"
