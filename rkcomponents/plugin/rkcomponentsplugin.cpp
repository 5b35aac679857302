#include "rkcomponentsplugin.h"
