#pragma once

#include "TelephonyService/ScenarioRandom.h"

#include <cstddef>
#include <vector>

namespace ventrik
{

/// What a signal loses on its way along a street, in dB below its level at the mast's foot.
double pathLoss(double metres);

/// Levels that wander about 0, one for each of several signals.
class Fading
{
  public:
    /// The memory, below 1, tells how slowly they wander; the spread, in dB, how far in a step.
    Fading(std::size_t signals, double memory, double spread);

    void step(ScenarioRandom& random);
    /// In dB.
    double level(std::size_t signal) const { return _levels.at(signal); }

  private:
    double _memory;
    double _spread;
    std::vector<double> _levels;
};

} // namespace ventrik
