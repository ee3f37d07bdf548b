#pragma once

#include "Model/ChangeStore.h"
#include "Model/PathSelection.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// A threshold for the numbers at some paths.
struct ValueAlert {
    enum class Comparison : std::uint8_t { Below, AtMost, Above, AtLeast };

    PathSelection paths;
    Comparison comparison;
    double threshold;
    std::string condition; ///< as it was written, "< -110"

    bool isBeyond(double number) const;
};

/// An alert, or one line that says what is wrong with its text.
struct AlertReading {
    std::optional<ValueAlert> alert;
    std::string error;
};

/// Of "PATH < NUMBER", "<=", ">" or ">=". Paths hold "*" and "**" as those of a PathSelection do.
/// What the comparison is stands last: names may hold one as well.
AlertReading parseAlert(std::string_view text);

/// Follows the numbers at an alert's paths and fires when one crosses its threshold: not for one
/// that was beyond from the start or stays so, and again only when it has come back in between. A
/// level that leaves out its sign is compared as it is drawn, below zero.
class AlertWatch
{
  public:
    explicit AlertWatch(ValueAlert alert) : _alert(std::move(alert)) {}

    const ValueAlert& alert() const { return _alert; }
    /// True when it fires. Places are those of the store that shows the value.
    bool take(PlaceId place, const PlaceTable& places, const StoredValue& shown);
    /// The places have new numbers.
    void forgetPlaces();

  private:
    enum class State : std::uint8_t { Unknown, NotWatched, Within, Beyond };

    State& stateOf(PlaceId place, const PlaceTable& places);

    ValueAlert _alert;
    std::vector<State> _states;        // by place
    std::vector<bool> _areWithoutSign; // likewise: levels of which a record leaves out the sign
};

} // namespace ventrik
