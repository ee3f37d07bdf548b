#pragma once

#include <cstdint>
#include <string>

namespace ventrik
{

// How decoded numbers are shown.

/// "%d"
std::string decimal(std::int32_t value);
/// "%u"
std::string unsignedDecimal(std::uint32_t value);
/// "%f"
std::string sixDecimals(double value);
/// "%f dB"
std::string sixDecimalsDb(double value);
/// "%d dB"
std::string wholeDb(std::int32_t value);
/// "%d dBm"
std::string wholeDbm(std::int32_t value);
/// "%4.2f dB"
std::string db(double value);
/// "%4.2f dBm"
std::string dbm(double value);
/// "%+d dBm"
std::string signedWholeDbm(std::int32_t value);
/// "%+.2f dB"
std::string signedDb(double value);
/// "%+.2f dBm"
std::string signedDbm(double value);

} // namespace ventrik
