#pragma once

namespace ventrik
{

/// Makes tables known to assistive technology as lists whose items are the rows in view. Asking for
/// it again does nothing.
void installTableAccessibility();

} // namespace ventrik
