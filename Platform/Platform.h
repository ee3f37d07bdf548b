#pragma once

#include "Platform/Clock.h"
#include "Platform/MainQueue.h"
#include "Platform/MessagePorts.h"
#include "Platform/Preferences.h"
#include "Platform/Resources.h"
#include "Platform/SystemLog.h"
#include "Platform/TelephonyClient.h"

namespace ventrik
{

/// What the core needs of the machine it runs on; owned by the program, which outlives the core.
struct Platform {
    MainQueue& mainQueue;
    MessagePorts& ports;
    TelephonyClient& telephony;
    SystemLog& log;
    Resources& resources;
    Preferences& preferences;
    Clock& clock;
};

} // namespace ventrik
