#pragma once

#include "Platform/Clock.h"

#include <chrono>

namespace ventrik
{

/// Which times are shown of those that there are: at first the newest, which follow what comes, a
/// minute and then all that there is up to five. Never outside of what there is, where that is
/// longer than what is shown.
class StripRange
{
  public:
    using Duration = std::chrono::nanoseconds;
    static constexpr Duration shortest = std::chrono::seconds(1);
    static constexpr Duration longest = std::chrono::days(366);
    static constexpr Duration shortestAtFirst = std::chrono::minutes(1);
    static constexpr Duration longestAtFirst = std::chrono::minutes(5);

    /// What there is now. `kept` is a time that does not leave the view by following.
    void setExtent(Clock::TimePoint first, Clock::TimePoint last);
    void setExtent(Clock::TimePoint first, Clock::TimePoint last, Clock::TimePoint kept);

    Clock::TimePoint first() const { return _last - _length; }
    Clock::TimePoint last() const { return _last; }
    Duration length() const { return _length; }
    bool isFollowing() const { return _isFollowing; }

    /// Shows later times, or earlier ones; at the newest it follows again.
    void pan(Duration by);
    /// From `first` on, for as long as before.
    void moveTo(Clock::TimePoint first);
    /// Shows a length times the factor, with the time staying where it is in the view.
    void zoom(double factor, Clock::TimePoint around);
    /// Shows all and goes on doing so.
    void fit();
    /// The newest, which it follows.
    void follow();
    /// Moves by no more than is needed for the time to be in view, with some around it.
    void reveal(Clock::TimePoint time);

  private:
    void fitNow();
    void followNow();
    void settle();

    Clock::TimePoint _extentFirst;
    Clock::TimePoint _extentLast;
    Clock::TimePoint _last;
    Duration _length = shortestAtFirst;
    bool _isFollowing = true;
    bool _fits = false;
    bool _grows = true; // while nobody chose a length
};

} // namespace ventrik
