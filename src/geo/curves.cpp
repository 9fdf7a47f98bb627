#include "basalt/geo/curves.h"
