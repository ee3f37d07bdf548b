#include "Packets/PacketBuilder.h"
#include "Platform/TelephonyConstants.h"
#include "Platform/TelephonyProtocol.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"
#include "TelephonyService/TelephonyService.h"
#include "Tests/Support/FakePlatform.h"
#include "Tests/TelephonyService/ListSource.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

Bytes xml(const PlistValue& value)
{
    return propertyListBytes(value).value();
}

class TelephonyServiceTest : public testing::Test
{
  protected:
    TelephonyServiceTest()
    {
        std::string error;
        EXPECT_TRUE(service->start(error)) << error;
        fake.ports.listen("client");
        fake.ports.listen("other");
    }

    // Sends a message to one of the service's ports and gives the answer.
    PlistDictionary ask(std::string_view port, const Bytes& request, bool isTrusted = true)
    {
        PlistDictionary answer;
        EXPECT_TRUE(fake.ports.deliver(
            port, 0, request,
            [&](const std::optional<Bytes>& reply) {
                const auto reading = reply ? readPropertyList(*reply) : PropertyListReading{};
                if (reading && reading.value->dictionary())
                    answer = *reading.value->dictionary();
            },
            isTrusted));
        fake.mainQueue.run();
        return answer;
    }
    PlistDictionary openChannel(std::string_view client, bool isTrusted = true)
    {
        return ask(telephonyServicePortName,
                   xml(PlistDictionary{
                       {TelephonyProtocol::commandKey, TelephonyProtocol::createLogChannelCommand},
                       {TelephonyProtocol::localPortKey, client}}),
                   isTrusted);
    }
    static int errorCode(const PlistDictionary& answer)
    {
        const PlistValue* code = answer.find(TelephonyProtocol::errorCodeKey);
        return code && code->integer() ? static_cast<int>(code->integer()->signedBits()) : -1;
    }
    static std::string remotePort(const PlistDictionary& answer)
    {
        const PlistValue* name = answer.find(TelephonyProtocol::remotePortKey);
        return name && name->string() ? *name->string() : "(none)";
    }
    void stream(const std::string& port)
    {
        ask(port, xml(PlistDictionary{{"SetState", "Streaming"},
                                      {"SetOrbelLogCodes", PlistArray{7}},
                                      {"SetQxExtraCodes", PlistArray()}}));
    }

    FakePlatform fake;
    std::unique_ptr<TelephonyService> service = std::make_unique<TelephonyService>(
        fake.mainQueue, fake.ports, fake.log,
        LogChannelContent{"tech", [] {
                              return std::make_unique<ListSource>(
                                  std::deque<TimedMessage>{{0ms, PacketBuilder(7).build()}});
                          }});
};

} // namespace

TEST_F(TelephonyServiceTest, OpensALogChannelForAClient)
{
    const auto answer = openChannel("client");
    EXPECT_EQ(errorCode(answer), 0);
    EXPECT_EQ(remotePort(answer), "org.ventrik.TelephonyService.LogChannel.1");
    const auto technology =
        ask(remotePort(answer), xml(PlistDictionary{{"GetTechnology", "GetTechnology"}}));
    EXPECT_EQ(*technology.find("GetTechnology"), PlistValue("tech"));
}

TEST_F(TelephonyServiceTest, ServesSeveralClientsAtOnce)
{
    stream(remotePort(openChannel("client")));
    stream(remotePort(openChannel("other")));
    fake.mainQueue.advance(1s);
    ASSERT_EQ(fake.ports.sends().size(), 2U);
    EXPECT_EQ(fake.ports.sends()[0].portName, "client");
    EXPECT_EQ(fake.ports.sends()[1].portName, "other");
}

TEST_F(TelephonyServiceTest, AClientThatComesAgainGetsANewChannelForTheOldOne)
{
    const auto first = remotePort(openChannel("client"));
    const auto second = remotePort(openChannel("client"));
    EXPECT_NE(first, second);
    EXPECT_EQ(service->channelCount(), 1U);
    EXPECT_EQ(fake.ports.localPort(first), nullptr);
}

TEST_F(TelephonyServiceTest, AChannelEndsWithItsClient)
{
    const auto name = remotePort(openChannel("client"));
    fake.ports.killRemote("client");
    fake.mainQueue.run();
    EXPECT_EQ(service->channelCount(), 0U);
    EXPECT_EQ(fake.ports.localPort(name), nullptr);
}

TEST_F(TelephonyServiceTest, RefusesACallerOfAnotherUser)
{
    const auto answer = openChannel("client", false);
    EXPECT_EQ(errorCode(answer), EPERM);
    EXPECT_EQ(remotePort(answer), "(none)");
    EXPECT_EQ(service->channelCount(), 0U);
}

TEST_F(TelephonyServiceTest, RefusesAClientWhoseLocalPortIsNotThere)
{
    EXPECT_EQ(errorCode(openChannel("nobody")), ENOENT);
}

TEST_F(TelephonyServiceTest, RefusesAClientThatNamesAPortOfTheService)
{
    const auto channel = remotePort(openChannel("client"));
    for (const std::string& name : {std::string(telephonyServicePortName), channel}) {
        fake.ports.listen(name);
        EXPECT_EQ(errorCode(openChannel(name)), EINVAL);
        EXPECT_TRUE(fake.log.contains("Refused a log channel for " + name +
                                      ": that is a port of the service"));
    }
    EXPECT_EQ(service->channelCount(), 1U);
}

TEST_F(TelephonyServiceTest, TakesAClientWhoseNameOnlyBeginsLikeItsOwn)
{
    const std::string name = std::string(telephonyServicePortName) + "Viewer";
    fake.ports.listen(name);
    EXPECT_EQ(errorCode(openChannel(name)), 0);
}

TEST_F(TelephonyServiceTest, RefusesRequestsItDoesNotUnderstand)
{
    EXPECT_EQ(errorCode(ask(telephonyServicePortName, Bytes{'x'})), EINVAL);
    EXPECT_EQ(errorCode(ask(telephonyServicePortName, xml("text"))), EINVAL);
    EXPECT_EQ(errorCode(ask(telephonyServicePortName, xml(PlistDictionary()))), EINVAL);
    EXPECT_EQ(errorCode(ask(telephonyServicePortName,
                            xml(PlistDictionary{{TelephonyProtocol::commandKey,
                                                 TelephonyProtocol::createLogChannelCommand},
                                                {TelephonyProtocol::localPortKey, 5}}))),
              EINVAL);
}

TEST_F(TelephonyServiceTest, TheNumberOfChannelsIsBounded)
{
    for (int i = 0; i < 64; ++i) {
        fake.ports.listen(fmt::format("client {}", i));
        EXPECT_EQ(errorCode(openChannel(fmt::format("client {}", i))), 0);
    }
    EXPECT_EQ(errorCode(openChannel("other")), EMFILE);
}

TEST_F(TelephonyServiceTest, TheEndClosesEveryPort)
{
    const auto name = remotePort(openChannel("client"));
    service.reset();
    EXPECT_EQ(fake.ports.localPort(telephonyServicePortName), nullptr);
    EXPECT_EQ(fake.ports.localPort(name), nullptr);
    EXPECT_TRUE(fake.ports.remotePorts("client").empty());
}

TEST_F(TelephonyServiceTest, ASecondServiceCannotStart)
{
    TelephonyService second(fake.mainQueue, fake.ports, fake.log, {"tech", {}});
    std::string error;
    EXPECT_FALSE(second.start(error));
    EXPECT_EQ(error, "the service's port exists already");
}

} // namespace ventrik
