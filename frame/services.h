// frame/services.h -- the platform services and data areas the library imports (internal).
// Everything is reached through the exported names of the platform libraries, so a host's
// own libraries take their place at load time.
#pragma once
#include "companions/data/data_api.h"
#include "companions/framework/framework_api.h"
#include "companions/system/system_api.h"
