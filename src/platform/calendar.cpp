#include "basalt/platform/calendar.h"
