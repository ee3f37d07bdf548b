#pragma once

#include <exception>

namespace ventrik
{

/// Raised out of a section whose packet carries data that does not parse, after the section has
/// reported it. Contained where the packet is delivered.
class UnparsableDataException : public std::exception
{
};

} // namespace ventrik
