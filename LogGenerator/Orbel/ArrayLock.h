#pragma once

#include <cstdint>
#include <mutex>

namespace ventrik
{

/// The one lock between sections that replace their lists and readers that walk them: a recursive
/// lock and a nesting counter, both process-wide.
///
/// Unlocking releases only when the counter comes back to 0, and then once: after two nested pairs
/// the lock is still held one level. All callers run on the main thread, where that costs nothing;
/// another thread, once there is one, stays out of the lists.
class ArrayLock
{
  public:
    static void lockArray();
    static void unlockArray();

    static std::recursive_mutex& lock();

    /// Holds the lock for a scope.
    class Scope
    {
      public:
        Scope() { lockArray(); }
        ~Scope() { unlockArray(); }
        Scope(const Scope&) = delete;
        Scope& operator=(const Scope&) = delete;
    };
};

} // namespace ventrik
