#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// How many blocks of each UMTS transport channel came in error.
class BLER : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;
};

} // namespace ventrik
