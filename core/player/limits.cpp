#include "core/player/limits.h"

SLimits gLimits;
