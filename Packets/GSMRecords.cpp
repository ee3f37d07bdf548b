#include "Packets/GSMRecords.h"

namespace ventrik
{

namespace
{

// A filler, as in a network code of two digits, is a blank.
char digit(std::int64_t nibbles, unsigned index)
{
    const auto nibble = nibbles >> (4 * index) & 0xF;
    return nibble <= 9 ? static_cast<char>('0' + nibble) : ' ';
}

} // namespace

std::string GSMRecords::countryCode(std::int64_t nibbles)
{
    return {digit(nibbles, 0), digit(nibbles, 1), digit(nibbles, 2)};
}

std::string GSMRecords::networkCode(std::int64_t nibbles)
{
    return {digit(nibbles, 1), digit(nibbles, 2), digit(nibbles, 0)};
}

double GSMRecords::digitsOfEverySecondByte(std::int64_t bytes)
{
    const auto digit = [&](unsigned index) { return bytes >> (16 * index) & 0xFF; };
    return static_cast<double>(digit(0) * 100 + digit(1) * 10 + digit(2));
}

} // namespace ventrik
