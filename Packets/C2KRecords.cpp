#include "Packets/C2KRecords.h"

#include <cmath>

namespace ventrik
{

double C2KRecords::strengthInDb(std::int64_t steps)
{
    constexpr double step = 1.0 / 512;
    return 10.0 * std::log10(static_cast<double>(steps) * step);
}

} // namespace ventrik
