#pragma once

#include "Model/ChangeStore.h"
#include "Model/ValueAlert.h"

#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

enum class EventKind : std::uint8_t {
    Cell,
    RRC,
    Registration,
    Technology,
    Call,
    DataSession,
    SIM,
    Channel,
    Alert,
};
std::string_view nameOf(EventKind kind);

/// Something that happened, as a line.
struct Event {
    Clock::TimePoint time;
    std::uint64_t moment; ///< of the store, after the message that told it
    EventKind kind;
    std::string text; ///< "PCI 301 → 87, E-ARFCN 1300 → 6300"
    std::string path; ///< of the pane that shows it
    bool isMark;      ///< what happened to the serving cell, the radio's state or the technology
    std::optional<std::size_t> alert = {}; ///< of an alert, which of those that were given
};

/// Makes events of what a store takes. What a value says first makes none, but for the technology
/// and the channel; nor does a value that goes away, only another one that comes in its place.
class EventLog
{
  public:
    static constexpr std::size_t mostEvents = 10000;

    /// The store outlives it.
    explicit EventLog(const ChangeStore& store, std::vector<ValueAlert> alerts = {});
    ~EventLog();

    /// Follows the store from where it stopped, and returns what is new.
    std::vector<Event> update();
    /// The newest last; the oldest go when there are too many.
    const std::deque<Event>& events() const { return _events; }

  private:
    class Follower;

    std::deque<Event> _events;
    std::unique_ptr<Follower> _follower;
};

} // namespace ventrik
