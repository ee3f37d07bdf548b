#include "Platform/Linux/SessionBus.h"

#include "Platform/Linux/Socket.h"
#include "PropertyList/XmlText.h"

#include <cstring>
#include <memory>
#include <system_error>

#include <QFile>

#include <systemd/sd-bus.h>

namespace ventrik
{

namespace
{

struct BusCloser {
    void operator()(sd_bus* bus) const { sd_bus_close_unref(bus); }
};
struct MessageReleaser {
    void operator()(sd_bus_message* message) const { sd_bus_message_unref(message); }
};

// The library's results: a negative one is an error number.
int checked(int result)
{
    if (result < 0)
        throw std::system_error(-result, std::generic_category());
    return result;
}

class BusConnection
{
  public:
    BusConnection(const std::string& address, const Deadline& deadline) : _deadline(deadline)
    {
        sd_bus* bus = nullptr;
        checked(sd_bus_new(&bus));
        _bus.reset(bus);
        checked(sd_bus_set_address(bus, address.c_str()));
        checked(sd_bus_set_bus_client(bus, 1)); // says hello by itself
        checked(sd_bus_start(bus));
    }

    void send(const BusSignal& signal)
    {
        sd_bus_message* made = nullptr;
        checked(sd_bus_message_new_signal(_bus.get(), &made, signal.path.c_str(),
                                          signal.interface.c_str(), signal.member.c_str()));
        const std::unique_ptr<sd_bus_message, MessageReleaser> message(made);
        for (const std::string& argument : signal.arguments)
            checked(sd_bus_message_append_basic(made, 's', argument.c_str()));
        checked(sd_bus_send(_bus.get(), made, nullptr));
    }
    void send(const std::string& notice)
    {
        constexpr const char* service = "org.freedesktop.Notifications";
        sd_bus_message* made = nullptr;
        checked(sd_bus_message_new_method_call(
            _bus.get(), &made, service, "/org/freedesktop/Notifications", service, "Notify"));
        const std::unique_ptr<sd_bus_message, MessageReleaser> message(made);
        checked(sd_bus_message_set_expect_reply(made, 0));
        constexpr std::uint32_t replacesNone = 0;
        constexpr std::int32_t usualTime = -1;
        // As the summary, in which no character is markup; no body, no actions and no hints.
        checked(sd_bus_message_append(made, "susssasa{sv}i", "Ventrik", replacesNone, "ventrik",
                                      notice.c_str(), "", 0, 0, usualTime));
        checked(sd_bus_send(_bus.get(), made, nullptr));
    }
    /// The answer to a question tells that what came before has been taken.
    void waitUntilTaken()
    {
        checked(sd_bus_call_method_async(
            _bus.get(), nullptr, "org.freedesktop.DBus", "/org/freedesktop/DBus",
            "org.freedesktop.DBus.Peer", "Ping",
            [](sd_bus_message*, void* self, sd_bus_error*) {
                static_cast<BusConnection*>(self)->_isTaken = true;
                return 0;
            },
            this, ""));
        while (!_isTaken) {
            if (checked(sd_bus_process(_bus.get(), nullptr)) > 0)
                continue;
            const auto rest =
                std::chrono::duration_cast<std::chrono::microseconds>(_deadline.remaining());
            if (rest.count() == 0)
                throw std::system_error(ETIMEDOUT, std::generic_category());
            checked(sd_bus_wait(_bus.get(), static_cast<std::uint64_t>(rest.count())));
        }
    }

  private:
    const Deadline& _deadline;
    bool _isTaken = false;
    std::unique_ptr<sd_bus, BusCloser> _bus;
};

template <typename Sent>
std::optional<std::string> sendOnBus(const std::string& address, const Sent& sent,
                                     std::chrono::milliseconds longestWait)
{
    const Deadline deadline(longestWait);
    try {
        BusConnection bus(address, deadline);
        bus.send(sent);
        bus.waitUntilTaken();
        return std::nullopt;
    } catch (const std::system_error& error) {
        return error.code() == std::errc::timed_out ? "it does not answer" : error.code().message();
    }
}

} // namespace

std::optional<std::string> sessionBusAddress()
{
    if (const QByteArray address = qgetenv("DBUS_SESSION_BUS_ADDRESS"); !address.isEmpty())
        return address.toStdString();
    const QByteArray socket = qgetenv("XDG_RUNTIME_DIR") + "/bus";
    if (socket == "/bus" || !socket.startsWith('/') || !QFile::exists(QFile::decodeName(socket)))
        return std::nullopt;
    return "unix:path=" + socket.toPercentEncoding("/").toStdString();
}

std::optional<std::string> sendBusSignal(const std::string& address, const BusSignal& signal,
                                         std::chrono::milliseconds longestWait)
{
    return sendOnBus(address, signal, longestWait);
}

std::optional<std::string> sendBusNotice(const std::string& address, const std::string& text,
                                         std::chrono::milliseconds longestWait)
{
    std::size_t replaced = 0;
    return sendOnBus(address, replaceUnfit(text, replaced), longestWait);
}

} // namespace ventrik
