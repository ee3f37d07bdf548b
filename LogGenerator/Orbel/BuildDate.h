#pragma once

namespace ventrik
{

/// When this program was built, as month abbreviation, day, year and time: "Nov 28 2021 21:22:43".
const char* buildDate();

} // namespace ventrik
