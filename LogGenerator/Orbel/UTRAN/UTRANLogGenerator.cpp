#include "LogGenerator/Orbel/UTRAN/UTRANLogGenerator.h"

#include "LogGenerator/Orbel/UTRAN/UTRANClassIndex.h"

#include <algorithm>
#include <cctype>
#include <filesystem>

namespace ventrik
{

namespace
{

bool containsIgnoringCase(std::string_view text, std::string_view part)
{
    const auto same = [](unsigned char a, unsigned char b) {
        return std::toupper(a) == std::toupper(b);
    };
    return std::search(text.begin(), text.end(), part.begin(), part.end(), same) != text.end();
}

} // namespace

std::unique_ptr<UTRANLogGenerator> UTRANLogGenerator::generator(const GeneratorServices& services)
{
    auto result = std::unique_ptr<UTRANLogGenerator>(new UTRANLogGenerator(services));
    result->init();
    return result;
}

void UTRANLogGenerator::init()
{
    const auto paths = resources().paths("plist");
    const auto path = std::ranges::find_if(paths, [](const std::string& candidate) {
        return containsIgnoringCase(candidate, "UTRAN");
    });
    if (path == paths.end())
        return;
    initWithPListName(std::filesystem::path(*path).stem().string(),
                      std::make_shared<UTRANClassIndex>(log(), records()));
    log().error("Created UTRANLogGenerator object");
}

} // namespace ventrik
