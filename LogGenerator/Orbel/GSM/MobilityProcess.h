#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// What the mobility-management processes share: each shows the states of its own record, and all
/// show the registration state.
class MobilityProcess : public Base
{
  public:
    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  protected:
    /// The tag is what the section traces; the code is that of its state record.
    MobilityProcess(SystemLog& log, std::string_view tag, std::uint32_t stateLogCode)
        : Base(log), _tag(tag), _stateLogCode(stateLogCode)
    {
    }

  private:
    /// Shows a state record, which is complete.
    virtual void updateFromState(const LogPacket& packet) = 0;
    void updateFromRegistration(const LogPacket& packet);

    std::string_view _tag;
    std::uint32_t _stateLogCode;
};

} // namespace ventrik
