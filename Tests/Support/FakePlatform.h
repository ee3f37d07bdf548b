#pragma once

#include "Platform/Platform.h"
#include "Tests/Support/CapturingSystemLog.h"
#include "Tests/Support/FakeMessagePorts.h"
#include "Tests/Support/FakeTelephonyClient.h"
#include "Tests/Support/FixedClock.h"
#include "Tests/Support/ManualMainQueue.h"
#include "Tests/Support/MemoryPreferences.h"
#include "Tests/Support/MemoryResources.h"

#include <memory>

namespace ventrik
{

/// One of each fake. It must outlive whatever uses its bundle; ports and telephony share a record.
struct FakePlatform {
    std::shared_ptr<OperationRecord> record = std::make_shared<OperationRecord>();
    ManualMainQueue mainQueue;
    FakeMessagePorts ports{mainQueue, record};
    FakeTelephonyClient telephony{record};
    CapturingSystemLog log;
    MemoryResources resources;
    MemoryPreferences preferences;
    FixedClock clock;

    Platform platform()
    {
        return {mainQueue, ports, telephony, log, resources, preferences, clock};
    }
};

} // namespace ventrik
