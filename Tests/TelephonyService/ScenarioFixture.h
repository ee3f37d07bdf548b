#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "TelephonyService/MessageSource.h"
#include "Tests/Support/FakePlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <map>
#include <set>
#include <string>
#include <vector>

namespace ventrik
{

std::vector<TimedMessage> messagesUpTo(MessageSource& source, std::chrono::seconds end);
std::uint32_t codeOf(const TimedMessage& message);
std::set<std::uint32_t> codesOf(const std::vector<TimedMessage>& messages);
bool areSame(const std::vector<TimedMessage>& a, const std::vector<TimedMessage>& b);
/// The most messages that are due at one moment.
int largestBurst(const std::vector<TimedMessage>& messages);
std::size_t prefixedCount(const std::vector<TimedMessage>& messages);

/// Collects what the decoders show of a scenario.
class ScenarioFixture : public testing::Test
{
  protected:
    /// Runs the messages through the generator of a technology, with the template of that name.
    void decode(const std::vector<TimedMessage>& messages, std::string_view technology,
                const std::string& templateName);

    /// The lowest and the highest number shown under a key.
    std::pair<double, double> rangeOf(const std::string& key);

    /// Every text that was ever shown, by the last two steps of its path.
    std::map<std::string, std::set<std::string>> shown;

  private:
    void collect(const PlistValue& value, const std::string& parent, const std::string& name);

    FakePlatform fake;
};

} // namespace ventrik
