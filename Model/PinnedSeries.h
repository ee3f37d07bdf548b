#pragma once

#include "Model/ChangeStore.h"
#include "Model/SeriesPoint.h"

#include <cstdint>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// The values that are drawn over time: paths of the display. A part "*" stands for the elements of
/// a list: of those the highest number is drawn.
struct Pin {
    std::string path;
    std::string name; ///< in the chart
    /// A level in dBm that some records tell without its sign: it is drawn below 0.
    bool leavesOutSign = false;
    /// That it is drawn with, where records differ in it; empty: as they tell it.
    std::string unit = {};

    /// What is pinned from the start stays what it is. Else with the name that the path has: that
    /// of the value; for a list's, "Best" before it; for a level without its sign, "GSM".
    static Pin of(std::string path);
    bool matches(std::string_view valuePath) const;
    bool operator==(const Pin&) const = default;
};

/// Whether the value at a path is such a level, one that leaves out its sign.
bool isLevelWithoutSign(std::string_view path);
/// The number that it is drawn at, in dBm.
double drawnLevel(double number);

/// What a technology shows over time from the start: the levels of the serving cell and of the best
/// neighbor.
std::vector<Pin> defaultPins(std::string_view technology);

/// Numbers over time of what is pinned, as far as a store has them. It follows the store.
class PinnedSeries : private StoreVisitor
{
  public:
    static constexpr std::size_t mostPins = 24;

    struct Series {
        Pin pin;
        std::string unit;
        std::vector<SeriesPoint> points;
    };

    /// The store outlives it.
    explicit PinnedSeries(const ChangeStore& store) : _store(store) {}

    /// What is beyond `mostPins` is left out.
    void setPins(std::vector<Pin> pins);
    /// Takes what is new in the store.
    void update();
    std::span<const Series> series() const { return _series; }

  private:
    /// What is known of a pin while changes are gone through.
    struct Follower {
        std::map<PlaceId, double> numbers; // of the places that it matches
        std::uint32_t logCode = 0;         // of the last change
    };
    struct PlacePins {
        bool isKnown = false;
        std::uint32_t pins = 0; // a bit for each
    };

    void changed(const StoredChange& change) override;
    void heard(Clock::TimePoint time, std::uint32_t logCode) override;
    std::uint32_t pinsAt(PlaceId place);
    void take(std::size_t pin, const StoredChange& change);
    void takeStanding();
    void dropOld();
    void beginAnew();

    const ChangeStore& _store;
    std::vector<Series> _series;
    std::vector<Follower> _followers; // of each series
    std::vector<PlacePins> _places;
    std::uint64_t _next = 0;
    std::size_t _generation = 0;
};

} // namespace ventrik
