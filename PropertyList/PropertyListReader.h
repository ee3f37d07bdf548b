#pragma once

#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>

namespace ventrik
{

// Limits that no message may pass, in either form: what comes from outside must neither exhaust the
// stack nor the memory.
inline constexpr std::size_t propertyListMaximumSize = std::size_t{64} << 20;
inline constexpr std::size_t propertyListMaximumDepth = 512;

/// A parsed property list, or one line that says what is wrong with the data and where.
struct PropertyListReading {
    std::optional<PlistValue> value;
    std::string error;

    explicit operator bool() const { return value.has_value(); }
};

/// Reads a serialised property list in either form; data that starts with "bplist" is binary.
PropertyListReading readPropertyList(ByteView data);

/// Reads the XML form (UTF-8). A document type line is skipped; nothing is fetched or expanded.
PropertyListReading readXmlPropertyList(ByteView data);

/// Reads the binary form, version "00".
PropertyListReading readBinaryPropertyList(ByteView data);

} // namespace ventrik
