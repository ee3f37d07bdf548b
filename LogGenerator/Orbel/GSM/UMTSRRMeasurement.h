#pragma once

#include "LogGenerator/Orbel/GSM/PlaceholderSection.h"

namespace ventrik
{

/// The place of the UMTS radio resource measurements.
class UMTSRRMeasurement : public PlaceholderSection
{
  public:
    explicit UMTSRRMeasurement(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
