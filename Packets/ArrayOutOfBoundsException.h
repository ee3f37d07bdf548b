#pragma once

#include <exception>

namespace ventrik
{

/// Raised by a record's element accessor for an index that is not below the count which the record
/// itself declares. The decode loops stay inside the count, so this is a guard only.
class ArrayOutOfBoundsException : public std::exception
{
};

} // namespace ventrik
