#include "TelephonyService/Propagation.h"

#include <cmath>

namespace ventrik
{

double pathLoss(double metres)
{
    constexpr double mastHeight = 30.0;
    return 38.0 * std::log10(std::hypot(metres, mastHeight) / mastHeight);
}

Fading::Fading(std::size_t signals, double memory, double spread)
    : _memory(memory), _spread(spread), _levels(signals)
{
}

void Fading::step(ScenarioRandom& random)
{
    for (double& level : _levels)
        level = _memory * level + random.uniform(-_spread, _spread);
}

} // namespace ventrik
