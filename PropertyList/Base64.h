#pragma once

#include "PropertyList/PlistValue.h"

#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

/// One line, padded with "=".
std::string encodeBase64(ByteView data);

/// White space may stand anywhere. Nothing when a character is not of the alphabet or the padding
/// is missing or misplaced.
std::optional<Bytes> decodeBase64(std::string_view text);

} // namespace ventrik
