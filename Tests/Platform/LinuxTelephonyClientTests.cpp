#include "Platform/Linux/LinuxTelephonyClient.h"

#include "Platform/TelephonyConstants.h"
#include "Platform/TelephonyProtocol.h"
#include "Tests/Support/FakePlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{
namespace
{

using ::testing::HasSubstr;
using namespace TelephonyProtocol;

// The client on fake ports: what goes out, and what it makes of the answers.
class LinuxTelephonyClientTest : public ::testing::Test
{
  protected:
    std::unique_ptr<ServerConnection> connect()
    {
        fakes.ports.listen(telephonyServicePortName);
        return client.createServerConnection([this] { ++notifications; });
    }
    LogChannelCreation createWithAnswer(const std::string& dictionary)
    {
        const std::string text = "<plist version=\"1.0\"><dict>" + dictionary + "</dict></plist>";
        fakes.ports.queueReply(Bytes(text.begin(), text.end()));
        return connect()->networkMonitorCreateLogChannel("local");
    }
    LogChannelCreation createWithError(int error)
    {
        fakes.ports.queueError(error);
        return connect()->networkMonitorCreateLogChannel("local");
    }
    static std::string errorPair(const std::string& domain, const std::string& code)
    {
        return "<key>ErrorDomain</key>" + domain + "<key>ErrorCode</key>" + code;
    }

    FakePlatform fakes;
    LinuxTelephonyClient client{fakes.ports, fakes.mainQueue};
    int notifications = 0;
};

TEST_F(LinuxTelephonyClientTest, GivesNoConnectionWithoutAService)
{
    EXPECT_EQ(client.createServerConnection({}), nullptr);
}

TEST_F(LinuxTelephonyClientTest, AsksForALogChannel)
{
    connect()->networkMonitorCreateLogChannel("local");
    ASSERT_EQ(fakes.ports.sends().size(), 1U);
    const RecordedSend& sent = fakes.ports.sends().front();
    const std::string text(sent.data.begin(), sent.data.end());
    EXPECT_EQ(sent.portName, "org.ventrik.TelephonyService");
    EXPECT_EQ(sent.id, 0);
    EXPECT_EQ(sent.sendTimeout, 1.0);
    EXPECT_EQ(sent.receiveTimeout, 1.0);
    EXPECT_TRUE(sent.replyWanted);
    EXPECT_THAT(text, HasSubstr("<string>CreateNetworkMonitorLogChannel</string>"));
    EXPECT_THAT(text, HasSubstr("<key>LocalPort</key>"));
    EXPECT_THAT(text, HasSubstr("<string>local</string>"));
}

TEST_F(LinuxTelephonyClientTest, ReadsTheRemotePort)
{
    const auto creation =
        createWithAnswer(errorPair("<integer>0</integer>", "<integer>0</integer>") +
                         "<key>RemotePort</key><string>remote</string>");
    EXPECT_EQ(creation.error.code, 0);
    EXPECT_EQ(creation.remotePortName, "remote");
}

TEST_F(LinuxTelephonyClientTest, ReadsTheServicesError)
{
    const auto creation =
        createWithAnswer(errorPair("<integer>2</integer>", "<integer>-35</integer>"));
    EXPECT_EQ(creation.error.domain, 2);
    EXPECT_EQ(creation.error.code, -35);
    EXPECT_EQ(creation.remotePortName, std::nullopt);
}

TEST_F(LinuxTelephonyClientTest, RefusesAnswersItDoesNotUnderstand)
{
    const std::string zero = "<integer>0</integer>";
    for (const std::string& answer :
         {std::string(), "<key>ErrorCode</key>" + zero, errorPair(zero, "<string>0</string>"),
          errorPair(zero, "<integer>4294967296</integer>"),
          errorPair(zero, zero) + "<key>RemotePort</key>" + zero}) {
        const auto creation = createWithAnswer(answer);
        EXPECT_EQ(creation.error.domain, 1) << answer;
        EXPECT_EQ(creation.error.code, 6) << answer;
    }
}

TEST_F(LinuxTelephonyClientTest, RefusesAnAnswerWithoutData)
{
    EXPECT_EQ(connect()->networkMonitorCreateLogChannel("local").error.code, 6);
}

TEST_F(LinuxTelephonyClientTest, TellsFaultsOfTheLineApart)
{
    EXPECT_EQ(createWithError(PortError::sendTimeout).error.code, 1);
    EXPECT_EQ(createWithError(PortError::receiveTimeout).error.code, 2);
    EXPECT_EQ(createWithError(PortError::invalidPort).error.code, 3);
    EXPECT_EQ(createWithError(PortError::transportFault).error.code, 4);
    EXPECT_EQ(createWithError(PortError::transportFault).error.domain, 1);
}

TEST_F(LinuxTelephonyClientTest, RefusesAPortNameThatXmlCannotCarry)
{
    EXPECT_EQ(connect()->networkMonitorCreateLogChannel("\x01").error.code, 5);
    EXPECT_TRUE(fakes.ports.sends().empty());
}

TEST_F(LinuxTelephonyClientTest, NotifiesWhenTheServiceGoes)
{
    const auto connection = connect();
    fakes.ports.killRemote(telephonyServicePortName);
    EXPECT_EQ(notifications, 0);
    fakes.mainQueue.run();
    EXPECT_EQ(notifications, 1);
}

TEST_F(LinuxTelephonyClientTest, NotifiesNobodyAfterTheConnectionEnded)
{
    auto connection = connect();
    fakes.ports.killRemote(telephonyServicePortName);
    connection.reset();
    fakes.mainQueue.run();
    EXPECT_EQ(notifications, 0);
}

} // namespace
} // namespace ventrik
