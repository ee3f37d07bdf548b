#include "LogGenerator/Orbel/ValueText.h"

#include <fmt/format.h>

namespace ventrik
{

std::string decimal(std::int32_t value)
{
    return fmt::format("{}", value);
}

std::string unsignedDecimal(std::uint32_t value)
{
    return fmt::format("{}", value);
}

std::string sixDecimals(double value)
{
    return fmt::format("{:f}", value);
}

std::string sixDecimalsDb(double value)
{
    return fmt::format("{:f} dB", value);
}

std::string wholeDb(std::int32_t value)
{
    return fmt::format("{} dB", value);
}

std::string wholeDbm(std::int32_t value)
{
    return fmt::format("{} dBm", value);
}

std::string db(double value)
{
    return fmt::format("{:>4.2f} dB", value);
}

std::string dbm(double value)
{
    return fmt::format("{:>4.2f} dBm", value);
}

std::string signedWholeDbm(std::int32_t value)
{
    return fmt::format("{:+} dBm", value);
}

std::string signedDb(double value)
{
    return fmt::format("{:+.2f} dB", value);
}

std::string signedDbm(double value)
{
    return fmt::format("{:+.2f} dBm", value);
}

} // namespace ventrik
