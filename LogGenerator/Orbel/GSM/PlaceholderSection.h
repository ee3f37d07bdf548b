#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// A section that wants no log codes: it keeps its place in the display, which stays as the
/// template laid it out.
class PlaceholderSection : public Base
{
  public:
    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  protected:
    /// The tag is what the section traces.
    PlaceholderSection(SystemLog& log, std::string_view tag) : Base(log), _tag(tag) {}

  private:
    std::string_view _tag;
};

} // namespace ventrik
