#pragma once

#include "Charts/QualityBands.h"
#include "Model/ValueAlert.h"
#include "Packets/Layouts.h"
#include "Platform/Technology.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

namespace ventrik
{

/// Says what is wrong with an option's value.
struct WrongValue : std::runtime_error {
    using std::runtime_error::runtime_error;
};

/// When a new file begins: at a size in bytes, or after a time.
struct Rotation {
    std::optional<std::uint64_t> size;
    std::optional<std::chrono::nanoseconds> time;
};

/// Values of options from their texts; WrongValue for what is none.
std::string textValue(const std::string& text);
std::uint32_t wholeNumberValue(const std::string& text);
/// At least 1.
std::uint32_t positiveWholeNumberValue(const std::string& text);
/// Finite and above 0.
double positiveNumberValue(const std::string& text);
std::optional<double> speedValue(const std::string& text); ///< a positive number, or none for "max"
Rotation rotationValue(const std::string& text);           ///< as in "100M" or "1h"
std::size_t historySizeValue(const std::string& text);     ///< at least "8M"
std::chrono::nanoseconds historyAgeValue(const std::string& text); ///< as in "24h"
/// Adds one to those that there are.
void addAlert(std::vector<ValueAlert>& alerts, const std::string& text);
void changeBands(QualityBands& bands, const std::string& text);
std::string directoryValue(const std::string& text); ///< one that is there
Technology technologyValue(const std::string& text);
RecordsMode recordsValue(const std::string& text);
int logLevelValue(const std::string& text); ///< see LogPriority

/// What the help says of them, as in "a, b or c".
std::string technologyNames();
std::string recordsNames();
std::string logLevelNames(int defaultLevel);

} // namespace ventrik
