#pragma once

#include "Tests/Support/MemoryResources.h"

#include <filesystem>

namespace ventrik
{

/// Adds a file under its own name; the test fails when it cannot be read.
void addFile(MemoryResources& resources, const std::filesystem::path& file);

/// Adds every display template of a directory.
void addTemplates(MemoryResources& resources, const std::filesystem::path& directory);

} // namespace ventrik
