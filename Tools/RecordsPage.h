#pragma once

#include <string>

namespace ventrik
{

/// A page in Markdown, made of the tables: for each log code its name, the sections that show it,
/// and its layouts with the places, scales and units of their fields.
std::string recordsPage();

} // namespace ventrik
