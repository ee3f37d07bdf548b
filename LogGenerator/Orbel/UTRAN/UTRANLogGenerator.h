#pragma once

#include "LogGenerator/Orbel/OrbelLogGenerator2.h"

namespace ventrik
{

/// The generator of the second UTRAN family. Its template is the first "plist" resource whose path
/// holds "UTRAN"; without one it stays unconfigured: it drops every packet, streams no codes and
/// loads no display.
class UTRANLogGenerator : public OrbelLogGenerator2
{
  public:
    static std::unique_ptr<UTRANLogGenerator> generator(const GeneratorServices& services);

  private:
    using OrbelLogGenerator2::OrbelLogGenerator2;

    void init();
};

} // namespace ventrik
