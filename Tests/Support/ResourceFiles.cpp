#include "Tests/Support/ResourceFiles.h"

#include <fstream>
#include <iterator>
#include <stdexcept>

namespace ventrik
{

void addFile(MemoryResources& resources, const std::filesystem::path& file)
{
    std::ifstream input(file, std::ios::binary);
    if (!input)
        throw std::runtime_error("cannot read " + file.string());
    resources.add("/res/" + file.filename().string(),
                  Bytes{std::istreambuf_iterator<char>(input), {}});
}

void addTemplates(MemoryResources& resources, const std::filesystem::path& directory)
{
    for (const auto& entry : std::filesystem::directory_iterator(directory))
        if (entry.path().extension() == ".plist")
            addFile(resources, entry.path());
}

} // namespace ventrik
