#pragma once

#include "Packets/Layouts.h"
#include "Platform/Clock.h"
#include "Platform/Resources.h"
#include "Platform/SystemLog.h"

namespace ventrik
{

/// What becomes of a message that breaks what the service promises.
enum class AssertionPolicy {
    EndProcess, ///< with the failure as the last line on standard error
    Throw,      ///< an `AssertionFailure`
};

/// What becomes of the raw packets of a display period.
enum class RawPackets {
    Kept, ///< for the history, whose snapshot holds them
    Dropped,
};

/// What a generator needs of the platform; all of it outlives the generator.
struct GeneratorServices {
    SystemLog& log;
    const Resources& resources;
    const Clock& clock;
    AssertionPolicy assertions = AssertionPolicy::EndProcess;
    RecordsMode records = RecordsMode::Newer;
    RawPackets rawPackets = RawPackets::Kept;
};

} // namespace ventrik
