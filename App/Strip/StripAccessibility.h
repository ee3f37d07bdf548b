#pragma once

namespace ventrik
{

/// Makes signal strips known to assistive technology as tables with a row for each line. Asking for
/// it again does nothing.
void installStripAccessibility();

} // namespace ventrik
