#pragma once

#include "LogGenerator/Orbel/Base.h"

namespace ventrik
{

/// The serving cell's identity, frequencies and access rules.
class UTRANServingCellInfo : public Base
{
  public:
    explicit UTRANServingCellInfo(SystemLog& log);

  private:
    void decode(const ShownRecord& shown, const LogPacket& packet) override;
    void showCell(const PlistDictionary& cell);
};

} // namespace ventrik
