#pragma once

#include "Model/VentrikModel.h"
#include "Packets/PacketBuilder.h"
#include "Platform/TelephonyConstants.h"
#include "Tests/Support/FakePlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{

/// A model on a fake platform whose service answers "GetTechnology" with LTE.
class ModelFixture : public testing::Test
{
  protected:
    static constexpr std::string_view remoteName = FakeTelephonyClient::defaultRemotePortName;

    ModelFixture();

    void answerTechnology(const PlistValue& technology);
    static Bytes xml(const PlistValue& value);
    /// Lets one message arrive on the model's local port.
    void arrive(const Bytes& message, std::int32_t id = 0);
    static Bytes cellInfo(std::uint16_t physicalCellId);

    /// Error lines with their addresses replaced by %p.
    std::vector<std::string> errors();

    FakePlatform fake;
    int redraws = 0;
    VentrikModel model{fake.platform(), [this] { ++redraws; }};
};

} // namespace ventrik
