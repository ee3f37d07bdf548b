#pragma once

#include "LogGenerator/Orbel/Base.h"

#include <initializer_list>

namespace ventrik
{

/// The serving cell's identity, frequencies and access rules.
class UTRANServingCellInfo : public Base
{
  public:
    using Base::Base;

    void updateWithData(const LogPacket& packet, std::uint32_t logCode) override;
    std::string_view getSectionName() const override;
    std::vector<std::uint32_t> getLogCodeArray() const override;

  private:
    void updateFromCellInfo(const LogPacket& packet);
    void updateFromCellMonitor(const LogPacket& packet);
    void showCell(const PlistDictionary& cell);
    /// Shows one number of a cell under each of the display keys.
    void showNumber(const PlistDictionary& cell, std::string_view cellKey,
                    std::string_view nameInLog,
                    std::initializer_list<std::string_view> displayKeys);
};

} // namespace ventrik
