#pragma once

#include <cstdint>
#include <random>

namespace ventrik
{

/// The chance in a scenario: the same numbers for the same seed, on every machine.
class ScenarioRandom
{
  public:
    explicit ScenarioRandom(std::uint32_t seed) : _generator(seed) {}

    /// Evenly spread from `from` to `to`, both included.
    double uniform(double from, double to)
    {
        constexpr double range = 4294967295.0;
        return from + (to - from) * static_cast<double>(_generator()) / range;
    }

  private:
    std::mt19937 _generator;
};

} // namespace ventrik
