#include "LogGenerator/Orbel/ArrayLock.h"

#include <gtest/gtest.h>

#include <thread>

namespace ventrik
{

namespace
{

bool isFreeForAnotherThread()
{
    bool isFree = false;
    std::thread([&] {
        isFree = ArrayLock::lock().try_lock();
        if (isFree)
            ArrayLock::lock().unlock();
    }).join();
    return isFree;
}

} // namespace

// ctest runs each test in a process of its own, so each starts with a free lock; a test that leaves
// the lock held gives it back for runs of the whole program.
TEST(ArrayLock, IsHeldBetweenLockAndUnlock)
{
    ArrayLock::lockArray();
    EXPECT_FALSE(isFreeForAnotherThread());
    ArrayLock::unlockArray();
    EXPECT_TRUE(isFreeForAnotherThread());
}

TEST(ArrayLock, StaysHeldOneLevelAfterTwoNestedPairs)
{
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    ArrayLock::unlockArray();
    EXPECT_FALSE(isFreeForAnotherThread());
    ArrayLock::lock().unlock(); // the level that was left
    EXPECT_TRUE(isFreeForAnotherThread());
}

TEST(ArrayLock, CounterWrapsAt256)
{
    for (int i = 0; i < 256; ++i)
        ArrayLock::lockArray();
    // The counter stands at 0 again: the first unlock makes it 255 and releases nothing.
    for (int i = 0; i < 256; ++i)
        ArrayLock::unlockArray();
    for (int i = 0; i < 255; ++i)
        ArrayLock::lock().unlock(); // 256 taken, one given back at the counter's 0
    EXPECT_TRUE(isFreeForAnotherThread());
}

TEST(ArrayLock, ScopeReleasesAtItsEnd)
{
    {
        const ArrayLock::Scope locked;
        EXPECT_FALSE(isFreeForAnotherThread());
    }
    EXPECT_TRUE(isFreeForAnotherThread());
}

} // namespace ventrik
