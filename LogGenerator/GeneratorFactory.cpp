#include "LogGenerator/C2K/C2KLogGenerator.h"
#include "LogGenerator/GSM/GSMLogGenerator.h"
#include "LogGenerator/Orbel/GSM/Orbel_GSMLogGenerator.h"
#include "LogGenerator/Orbel/LTE/LTELogGenerator.h"
#include "LogGenerator/Orbel/UTRAN/UTRANLogGenerator.h"
#include "Platform/Technology.h"

#include <array>

namespace ventrik
{

namespace
{

template <typename Generator>
std::unique_ptr<LogGenerator> make(const GeneratorServices& services)
{
    return Generator::generator(services);
}

struct GeneratorOfTechnology {
    const Technology& technology;
    std::unique_ptr<LogGenerator> (*makeGenerator)(const GeneratorServices& services);
};

constexpr std::array<GeneratorOfTechnology, 5> generators{{
    {Technologies::cellMonitor, make<GSMLogGenerator>},
    {Technologies::gsm, make<Orbel_GSMLogGenerator>},
    {Technologies::c2k, make<C2KLogGenerator>},
    {Technologies::lte, make<LTELogGenerator>},
    {Technologies::utran, make<UTRANLogGenerator>},
}};

} // namespace

std::unique_ptr<LogGenerator>
LogGenerator::generatorFromTechnology(const PlistValue& technology,
                                      const GeneratorServices& services)
{
    for (const GeneratorOfTechnology& known : generators)
        if (technology == known.technology.identifier)
            return known.makeGenerator(services);
    return nullptr;
}

std::function<std::unique_ptr<LogGenerator>(const PlistValue&, const GeneratorServices&)>
LogGenerator::generatorsReading(RecordsMode records)
{
    return [records](const PlistValue& technology, const GeneratorServices& services) {
        GeneratorServices with = services;
        with.records = records;
        return generatorFromTechnology(technology, with);
    };
}

} // namespace ventrik
