#pragma once

#include "LogGenerator/Orbel/GSM/PlaceholderSection.h"

namespace ventrik
{

/// The place of the coding scheme.
class CodingScheme : public PlaceholderSection
{
  public:
    explicit CodingScheme(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
