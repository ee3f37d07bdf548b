#include "LogGenerator/Orbel/ArrayLock.h"

namespace ventrik
{

namespace
{

std::uint8_t nestingCounter = 0;

} // namespace

std::recursive_mutex& ArrayLock::lock()
{
    static std::recursive_mutex mutex;
    return mutex;
}

void ArrayLock::lockArray()
{
    lock().lock();
    ++nestingCounter;
}

void ArrayLock::unlockArray()
{
    --nestingCounter;
    if (nestingCounter == 0)
        lock().unlock();
}

} // namespace ventrik
