#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// A set of UMTS cells that is not shown cell by cell: it follows the cell list's records, and each
/// of them leaves it empty.
class EmptySet : public Base
{
  public:
    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  protected:
    /// The tag is what the section traces.
    EmptySet(SystemLog& log, std::string_view tag) : Base(log), _tag(tag) {}

  private:
    std::string_view _tag;
};

} // namespace ventrik
