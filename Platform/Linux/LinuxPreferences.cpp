#include "Platform/Linux/LinuxPreferences.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QFile>
#include <QSettings>

namespace ventrik
{

namespace
{

QString toQString(std::string_view text)
{
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

// Returns when the bus has everything that was sent before. The library writes from a thread of its
// own, and a process that ends first takes along what is unwritten.
void waitUntilSent(const QDBusConnection& bus)
{
    constexpr int longestWait = 1000; // milliseconds
    bus.call(QDBusMessage::createMethodCall(
                 QStringLiteral("org.freedesktop.DBus"), QStringLiteral("/org/freedesktop/DBus"),
                 QStringLiteral("org.freedesktop.DBus.Peer"), QStringLiteral("Ping")),
             QDBus::Block, longestWait);
}

// Without an address the bus library would start a bus of its own, slowly, wherever there is a
// display.
bool hasSessionBus()
{
    if (!qEnvironmentVariableIsEmpty("DBUS_SESSION_BUS_ADDRESS"))
        return true;
    const QString runtimeDirectory = qEnvironmentVariable("XDG_RUNTIME_DIR");
    return !runtimeDirectory.isEmpty() && QFile::exists(runtimeDirectory + "/bus");
}

} // namespace

LinuxPreferences::LinuxPreferences() = default;

LinuxPreferences::~LinuxPreferences() = default;

void LinuxPreferences::set(std::string_view domain, std::string_view key, bool value)
{
    settings(domain).setValue(toQString(key), value);
}

bool LinuxPreferences::synchronize(std::string_view domain)
{
    QSettings& current = settings(domain);
    current.sync();
    return current.status() == QSettings::NoError;
}

void LinuxPreferences::postChanged(std::string_view domain, std::string_view key)
{
    if (!hasSessionBus())
        return;
    const QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected())
        return;
    auto signal = QDBusMessage::createSignal(QStringLiteral("/org/ventrik/Preferences"),
                                             QStringLiteral("org.ventrik.Preferences"),
                                             QStringLiteral("Changed"));
    signal << toQString(domain) << toQString(key);
    bus.send(signal);
    waitUntilSent(bus);
}

QSettings& LinuxPreferences::settings(std::string_view domain)
{
    auto found = _settings.find(domain);
    if (found == _settings.end()) {
        auto made = std::make_unique<QSettings>(QSettings::NativeFormat, QSettings::UserScope,
                                                toQString(domain));
        made->setFallbacksEnabled(false);
        found = _settings.emplace(std::string(domain), std::move(made)).first;
    }
    return *found->second;
}

} // namespace ventrik
