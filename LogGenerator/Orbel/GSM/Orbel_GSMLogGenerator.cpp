#include "LogGenerator/Orbel/GSM/Orbel_GSMLogGenerator.h"

#include "LogGenerator/Orbel/GSM/Orbel_GSMClassIndex.h"

namespace ventrik
{

std::unique_ptr<Orbel_GSMLogGenerator>
Orbel_GSMLogGenerator::generator(const GeneratorServices& services)
{
    auto result = std::unique_ptr<Orbel_GSMLogGenerator>(new Orbel_GSMLogGenerator(services));
    result->init();
    return result;
}

void Orbel_GSMLogGenerator::init()
{
    log().error("Creating Orbel_GSMLogGenerator object");
    initWithPListName("Orbel_GSM", std::make_shared<Orbel_GSMClassIndex>(log(), records()));
}

Orbel_GSMLogGenerator::~Orbel_GSMLogGenerator()
{
    log().warning("Orbel_GSMLogGenerator is destructed {}", fmt::ptr(this));
}

} // namespace ventrik
