#include "Tests/Support/FakePlatform.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace ventrik
{
namespace
{

using ::testing::ElementsAre;

TEST(FakeTelephonyClient, GivesNoConnectionWhileTheServiceIsAway)
{
    FakeTelephonyClient client;
    client.setServiceAvailable(false);
    EXPECT_EQ(client.createServerConnection({}), nullptr);
    client.setServiceAvailable(true);
    EXPECT_NE(client.createServerConnection({}), nullptr);
    EXPECT_EQ(client.creationCount(), 2U);
}

TEST(FakeTelephonyClient, GivesScriptedResults)
{
    FakeTelephonyClient client;
    const auto connection = client.createServerConnection({});
    client.queueError({2, 35});
    client.queueResult({{}, ""});
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("a").error.code, 35);
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("b").remotePortName, "");
    EXPECT_EQ(connection->networkMonitorCreateLogChannel("c").remotePortName,
              FakeTelephonyClient::defaultRemotePortName);
    EXPECT_THAT(client.requests(), ElementsAre("a", "b", "c"));
}

TEST(FakeTelephonyClient, NotifiesLiveConnections)
{
    FakeTelephonyClient client;
    int notifications = 0;
    std::unique_ptr<ServerConnection> connection;
    connection = client.createServerConnection([&] {
        ++notifications;
        connection.reset();
    });
    client.notify();
    client.notify();
    EXPECT_EQ(notifications, 1);
    EXPECT_EQ(client.liveConnectionCount(), 0U);
}

TEST(FakePlatform, SharesOneRecordOfOperations)
{
    FakePlatform fakes;
    const Platform platform = fakes.platform();
    auto connection = platform.telephony.createServerConnection({});
    auto local = platform.ports.createLocalPort("port", PortSenders::SameUser, nullptr).port;
    fakes.record->clear();
    local->invalidate();
    connection.reset();
    EXPECT_THAT(fakes.record->operations(),
                ElementsAre("local invalidated port", "connection released"));
}

} // namespace
} // namespace ventrik
