#include "Platform/Linux/LinuxPreferences.h"

#include "Files/PrivateFile.h"
#include "Platform/Linux/SessionBus.h"
#include "Platform/SystemLog.h"

#include <cerrno>
#include <cstring>
#include <filesystem>

#include <QDir>
#include <QSettings>

#include <unistd.h>

namespace ventrik
{

namespace
{

QString toQString(std::string_view text)
{
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

std::string fileOf(std::string_view domain)
{
    QString configuration = qEnvironmentVariable("XDG_CONFIG_HOME");
    if (!QDir::isAbsolutePath(configuration))
        configuration = QDir::homePath() + "/.config";
    return (configuration + '/' + toQString(domain) + ".conf").toStdString();
}

// Opening a pipe or a device may wait for ever or do something, and writing would replace it.
bool isTakenBySomethingElse(const std::string& file)
{
    std::error_code ignored;
    const auto status = std::filesystem::status(file, ignored);
    return std::filesystem::exists(status) && !std::filesystem::is_regular_file(status);
}

// The settings library tells that it failed, and not why.
std::string reasonWhyNotWritten(const std::string& file, QSettings::Status status)
{
    if (status == QSettings::FormatError)
        return "it is no preference file";
    const std::string directory = std::filesystem::path(file).parent_path();
    for (const std::string& place : {directory, file})
        if (access(place.c_str(), W_OK) != 0 && (place == directory || errno != ENOENT))
            return std::strerror(errno);
    return "it cannot be replaced";
}

} // namespace

LinuxPreferences::LinuxPreferences(SystemLog& log) : _log(log) {}

LinuxPreferences::~LinuxPreferences() = default;

void LinuxPreferences::set(std::string_view domain, std::string_view key, bool value)
{
    if (QSettings* current = settings(domain))
        current->setValue(toQString(key), value);
}

void LinuxPreferences::setText(std::string_view domain, std::string_view key,
                               std::string_view value)
{
    if (QSettings* current = settings(domain))
        current->setValue(toQString(key), toQString(value));
}

std::optional<std::string> LinuxPreferences::text(std::string_view domain, std::string_view key)
{
    const QSettings* current = settings(domain);
    if (!current || !current->contains(toQString(key)))
        return std::nullopt;
    return current->value(toQString(key)).toString().toStdString();
}

bool LinuxPreferences::synchronize(std::string_view domain)
{
    QSettings* current = settings(domain);
    if (!current) {
        _log.error("The preference was not written: {}: it is no file", fileOf(domain));
        return false;
    }
    // Where there is none and none can be made, the file cannot be written either.
    makePrivateDirectories(std::filesystem::path(fileOf(domain)).parent_path());
    current->sync();
    if (current->status() == QSettings::NoError)
        return true;
    const std::string file = current->fileName().toStdString();
    _log.error("The preference was not written: {}: {}", file,
               reasonWhyNotWritten(file, current->status()));
    return false;
}

void LinuxPreferences::postChanged(std::string_view domain, std::string_view key)
{
    constexpr std::chrono::milliseconds longestWait(800);
    const auto address = sessionBusAddress();
    if (!address)
        return;
    const BusSignal signal{"/org/ventrik/Preferences",
                           "org.ventrik.Preferences",
                           "Changed",
                           {std::string(domain), std::string(key)}};
    if (const auto reason = sendBusSignal(*address, signal, longestWait))
        _log.error("The session bus was not told of the preference: {}", *reason);
}

QSettings* LinuxPreferences::settings(std::string_view domain)
{
    const auto found = _settings.find(domain);
    if (found != _settings.end())
        return found->second.get();
    const std::string file = fileOf(domain);
    if (isTakenBySomethingElse(file))
        return nullptr;
    auto made = std::make_unique<QSettings>(toQString(file), QSettings::NativeFormat);
    return _settings.emplace(std::string(domain), std::move(made)).first->second.get();
}

} // namespace ventrik
