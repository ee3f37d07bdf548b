#pragma once

#include "Platform/Clock.h"
#include "Platform/Resources.h"
#include "Platform/SystemLog.h"

namespace ventrik
{

/// What a generator needs of the platform; all of it outlives the generator.
struct GeneratorServices {
    SystemLog& log;
    const Resources& resources;
    const Clock& clock;
};

} // namespace ventrik
