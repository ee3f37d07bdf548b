#pragma once

#include "TelephonyService/Propagation.h"
#include "TelephonyService/Scenario.h"
#include "TelephonyService/ScenarioRandom.h"

#include <cstddef>
#include <cstdint>

namespace ventrik
{

/// A walk among GSM and UMTS cells as an older baseband's service describes it: twice a second one
/// property list of nested dictionaries and arrays, all of whose leaves are texts. Every array
/// begins with a line for the service's own use. The same for the same seed.
class CellMonitorScenario : public Scenario
{
  public:
    explicit CellMonitorScenario(std::uint32_t seed);

  private:
    static constexpr std::size_t gsmCellCount = 5;
    static constexpr std::size_t umtsCellCount = 3;

    void reportStep() override;
    void move();
    bool isInCall() const;
    double gsmLevel(std::size_t cell) const;  ///< dBm
    double umtsLevel(std::size_t cell) const; ///< dBm
    double bitErrors() const;                 ///< 0, the best, to 7
    PlistValue registration() const;
    PlistDictionary servingCell() const;
    PlistDictionary call() const;
    PlistArray gsmNeighbors() const;
    PlistArray umtsNeighbors() const;

    ScenarioRandom _random;
    double _position = 0;  ///< metres
    double _direction = 1; ///< 1 or -1
    std::size_t _serving = 0;
    Fading _gsmShadowing{gsmCellCount, 0.99, 0.4};
    Fading _umtsShadowing{umtsCellCount, 0.99, 0.4};
};

} // namespace ventrik
