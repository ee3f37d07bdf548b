#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"

#include "LogGenerator/Orbel/LTE/LTEClassIndex.h"

namespace ventrik
{

std::unique_ptr<LTELogGenerator> LTELogGenerator::generator(const GeneratorServices& services)
{
    auto result = std::unique_ptr<LTELogGenerator>(new LTELogGenerator(services));
    result->init();
    return result;
}

void LTELogGenerator::init()
{
    log().error("Creating LTELogGenerator object");
    initWithPListName("LTE", std::make_shared<LTEClassIndex>(log(), records()));
    if (records() == RecordsMode::Extended)
        extendTemplate("LTEMore");
}

LTELogGenerator::~LTELogGenerator()
{
    log().warning("LTELogGenerator is destructed {}", fmt::ptr(this));
}

} // namespace ventrik
