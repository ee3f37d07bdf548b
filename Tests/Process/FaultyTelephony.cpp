// faulty-telephony MODE: a telephony service that misbehaves in the way that the mode names.
#include "Packets/PacketBuilder.h"
#include "Platform/Linux/LinuxMainQueue.h"
#include "Platform/Linux/LinuxMessagePorts.h"
#include "Platform/Linux/LinuxSystemLog.h"
#include "Platform/TelephonyConstants.h"
#include "Platform/TelephonyProtocol.h"
#include "PropertyList/PropertyListReader.h"
#include "PropertyList/PropertyListWriter.h"
#include "TelephonyService/LTEScenario.h"
#include "TelephonyService/TelephonyService.h"

#include <QCoreApplication>

#include <random>
#include <set>

#include <unistd.h>

using namespace ventrik;

namespace
{

constexpr std::string_view channelName = "org.ventrik.FaultyTelephony.LogChannel";
constexpr std::uint32_t cellMonitorCode = 0xFF0001;
constexpr std::uint32_t cellInfoCode = 0xB0C2;

Bytes serialized(const PlistValue& value)
{
    return propertyListBytes(value).value();
}

// A binary property list whose one array holds itself.
Bytes loopingPropertyList()
{
    Bytes bytes{'b', 'p', 'l', 'i', 's', 't', '0', '0', 0xA1, 0x00, 0x08};
    // Trailer: 6 unused, offset size 1, reference size 1, one object, the first is the root, the
    // offsets begin at byte 10.
    bytes.insert(bytes.end(), {0, 0, 0, 0, 0, 0, 1, 1, 0, 0, 0, 0, 0, 0, 0, 1,
                               0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 10});
    return bytes;
}

Bytes randomBytes(std::mt19937& random, std::size_t size)
{
    Bytes bytes(size);
    for (auto& byte : bytes)
        byte = static_cast<std::uint8_t>(random());
    return bytes;
}

std::vector<Bytes> makeGarbage()
{
    std::mt19937 random(1);
    std::vector<Bytes> messages{{}, {0x81}, {0x81, 0x00}, {0x81, 0x00, 0x01}, {0x02, 0x10}};
    for (std::size_t size = 0; size < 200; ++size)
        messages.push_back(randomBytes(random, size));
    for (std::size_t size = 0; size < 40; ++size) {
        Bytes scrap = randomBytes(random, size);
        scrap.insert(scrap.begin(), 0x81);
        messages.push_back(std::move(scrap));
    }
    messages.push_back(randomBytes(random, std::size_t{1} << 20));
    messages.push_back(PacketBuilder(0xB17F).size(std::size_t{1} << 20).build());
    messages.push_back(PacketBuilder(cellMonitorCode).bytes(13, loopingPropertyList()).build());
    messages.push_back(PacketBuilder(cellMonitorCode).bytes(13, randomBytes(random, 100)).build());
    // A type that no packet has.
    messages.push_back(PacketBuilder(cellInfoCode).type(7).size(38).build());
    return messages;
}

class FaultyService
{
  public:
    explicit FaultyService(std::string mode) : _mode(std::move(mode)) {}

    bool start()
    {
        _service = open(telephonyServicePortName, "silent",
                        [this](const PortMessage& message) { return answerRequest(message); });
        _channel = open(channelName, "silent-technology",
                        [this](const PortMessage& message) { return answerCommand(message); });
        return _service && _channel;
    }

  private:
    // The port that this mode leaves without an answer: its senders wait in vain.
    std::shared_ptr<LocalPort> open(std::string_view name, std::string_view silentMode,
                                    LocalPort::DataCallback callback)
    {
        auto port = _ports.createLocalPort(name, PortSenders::SameUser, std::move(callback)).port;
        if (port && _mode != silentMode && _mode != "silent")
            port->deliverOnMainQueue();
        return port;
    }

    std::optional<Bytes> answerRequest(const PortMessage& message)
    {
        const auto request = readPropertyList(message.data);
        if (const auto* port = request.value->dictionary()->find(TelephonyProtocol::localPortKey))
            _clientName = *port->string();
        PlistDictionary answer{{TelephonyProtocol::errorDomainKey, 2},
                               {TelephonyProtocol::errorCodeKey, _mode == "refuse" ? 13 : 0}};
        if (_mode == "empty-name")
            answer.set(TelephonyProtocol::remotePortKey, "");
        else if (_mode == "dead-name")
            answer.set(TelephonyProtocol::remotePortKey, "org.ventrik.Nobody");
        else if (_mode != "refuse" && _mode != "no-name")
            answer.set(TelephonyProtocol::remotePortKey, channelName);
        return serialized(answer);
    }

    std::optional<Bytes> answerCommand(const PortMessage& message)
    {
        const auto command = readPropertyList(message.data);
        if (command.value->dictionary()->contains("SetState")) {
            stream();
            return std::nullopt;
        }
        if (_mode == "garbage")
            return Bytes{'g', 'a', 'r', 'b', 'a', 'g', 'e', 0, 255};
        if (_mode == "no-reply")
            return std::nullopt;
        if (_mode == "no-answer")
            return serialized(PlistDictionary());
        if (_mode == "unknown")
            return serialized(PlistDictionary{{"GetTechnology", "Semaphore"}});
        return serialized(PlistDictionary{{"GetTechnology", kQXLogChannelTechnology_Orbel_LTE}});
    }

    // All the garbage, and then proper packets.
    void stream()
    {
        _client = _ports.createRemotePort(_clientName);
        _timer = _queue.repeatEvery(std::chrono::milliseconds(50), [this] {
            for (const Bytes& message : std::exchange(_garbage, {}))
                send(message);
            send(PacketBuilder(cellInfoCode).u16(14, 301).size(38).build());
        });
    }

    void send(const Bytes& message)
    {
        constexpr RemotePort::Seconds time{5.0};
        _client->send(0, message, time, time, RemotePort::Reply::NotWanted);
    }

    std::string _mode;
    LinuxSystemLog _log{"faulty-telephony"};
    LinuxMainQueue _queue;
    LinuxMessagePorts _ports{LinuxMessagePorts::defaultDirectory(), _log};
    std::shared_ptr<LocalPort> _service;
    std::shared_ptr<LocalPort> _channel;
    std::string _clientName;
    std::shared_ptr<RemotePort> _client;
    std::unique_ptr<RepeatingTimer> _timer;
    std::vector<Bytes> _garbage = makeGarbage();
};

// The proper service, run as if it were another user's.
int runForeignService()
{
    LinuxSystemLog log("faulty-telephony");
    LinuxMainQueue queue;
    LinuxMessagePorts ports(LinuxMessagePorts::defaultDirectory(), log, getuid() + 1);
    TelephonyService service(queue, ports, log,
                             {std::string(kQXLogChannelTechnology_Orbel_LTE),
                              [] { return std::make_unique<LTEScenario>(1); }});
    std::string error;
    return service.start(error) ? QCoreApplication::exec() : 1;
}

} // namespace

int main(int argc, char** argv)
{
    const std::set<std::string_view> modes{
        "silent", "silent-technology", "garbage", "no-answer", "no-reply",      "unknown",
        "refuse", "empty-name",        "no-name", "dead-name", "garbage-stream"};
    const QCoreApplication application(argc, argv);
    const std::string mode = argc == 2 ? argv[1] : "";
    if (mode == "foreign")
        return runForeignService();
    if (!modes.contains(mode))
        return 2;
    FaultyService service(mode);
    return service.start() ? QCoreApplication::exec() : 1;
}
