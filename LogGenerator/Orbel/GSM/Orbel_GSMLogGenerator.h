#pragma once

#include "LogGenerator/Orbel/OrbelLogGenerator2.h"

namespace ventrik
{

/// The generator of the GSM/UMTS family: the template "Orbel_GSM" and its sections.
class Orbel_GSMLogGenerator : public OrbelLogGenerator2
{
  public:
    static std::unique_ptr<Orbel_GSMLogGenerator> generator(const GeneratorServices& services);
    ~Orbel_GSMLogGenerator() override;

  private:
    using OrbelLogGenerator2::OrbelLogGenerator2;

    void init();
};

} // namespace ventrik
