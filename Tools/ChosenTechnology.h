#pragma once

#include "Capture/CaptureReader.h"
#include "Platform/Technology.h"

#include <optional>
#include <string>

namespace ventrik
{

/// The technology by which a capture is decoded.
struct ChosenTechnology {
    std::optional<Technology> technology; ///< none where nothing tells it
    std::string remark; ///< in one line: that it is a guess, or why there is none; else empty
};

/// What was said, else what the capture tells, else what its records tell.
ChosenTechnology chooseTechnology(const std::string& capture, const std::optional<Technology>& said,
                                  CaptureReader& reader);

} // namespace ventrik
