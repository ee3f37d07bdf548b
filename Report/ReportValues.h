#pragma once

#include "Model/DisplayMoment.h"
#include "Report/HtmlWriter.h"

#include <cstddef>

namespace ventrik
{

/// The tree of a moment: sections with tables of values, groups and lists below to be folded. What
/// does not fit into the bytes is counted. Values that cannot be are marked, with the reason.
void writeValues(HtmlWriter& html, DisplayMoment& display, std::size_t mostBytes);

} // namespace ventrik
