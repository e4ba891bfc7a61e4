// The allocation fault hook moved to the platform, where the module's Windows stand-ins
// use it too; src/io still includes it by this name.
#pragma once

#include "platform/allocation.h"
