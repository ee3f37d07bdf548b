#pragma once

#include "LogGenerator/Orbel/OrbelLogGenerator2.h"

namespace ventrik
{

/// The generator of the LTE family: the template "LTE" and its sections.
class LTELogGenerator : public OrbelLogGenerator2
{
  public:
    static std::unique_ptr<LTELogGenerator> generator(const GeneratorServices& services);
    ~LTELogGenerator() override;

  private:
    using OrbelLogGenerator2::OrbelLogGenerator2;

    void init();
};

} // namespace ventrik
