#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "Tests/Support/CapturingSystemLog.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/MemoryResources.h"

namespace ventrik
{

/// The platform's parts for a generator that uses none of them.
struct IdleServices {
    CapturingSystemLog idleLog;
    MemoryResources idleResources;
    FixedClock idleClock;
};

/// A generator that decodes nothing, for tests that need one to ask.
class IdleGenerator : private IdleServices, public LogGenerator
{
  public:
    IdleGenerator() : LogGenerator({idleLog, idleResources, idleClock}) {}

    void updateState(PlistDictionary&, ByteView) override {}
    std::optional<PlistValue> generateLogUsingState(PlistDictionary&) override { return {}; }
    PlistDictionary getStartCommand() const override { return {}; }
    PlistValue getSaveContentsFromState(const PlistDictionary&) const override
    {
        return PlistArray();
    }
};

} // namespace ventrik
