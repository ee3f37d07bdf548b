#pragma once

#include "LogGenerator/Orbel/GSM/EmptySet.h"

namespace ventrik
{

/// The cells of the active set kept for another frequency.
class VirtualActiveSet : public EmptySet
{
  public:
    explicit VirtualActiveSet(SystemLog& log);

    std::string_view getSectionName() const override;
};

} // namespace ventrik
