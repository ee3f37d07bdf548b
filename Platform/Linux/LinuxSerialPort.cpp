#include "Platform/Linux/LinuxSerialPort.h"

#include <QDeadlineTimer>
#include <QSerialPort>

#include <array>
#include <filesystem>
#include <utility>

namespace ventrik
{

namespace
{

constexpr qint64 blockSize = 65536;        // of what is read in one turn of the event loop
constexpr qint64 longestBacklog = 1 << 20; // of what the device does not take
constexpr qint32 baudRate = 115200;        // diagnostic ports of today take any

// The toolkit takes a relative path for one below /dev.
QString nameOf(const std::string& device)
{
    if (device.find('/') == std::string::npos)
        return QString::fromStdString(device);
    std::error_code error;
    return QString::fromStdString(std::filesystem::absolute(device, error));
}

class LinuxSerialPort : public SerialPort
{
  public:
    explicit LinuxSerialPort(Events events) : _events(std::move(events)) {}
    ~LinuxSerialPort() override { _port.disconnect(); }

    bool open(const std::string& device, std::string& error)
    {
        _port.setPortName(nameOf(device));
        _port.setBaudRate(baudRate);
        _port.setReadBufferSize(blockSize);
        if (!_port.open(QIODevice::ReadWrite)) {
            error = _port.errorString().toStdString();
            return false;
        }
        QObject::connect(&_port, &QSerialPort::readyRead, &_port, [this] { read(); });
        // Queued, because the toolkit also tells of errors within a call.
        QObject::connect(
            &_port, &QSerialPort::errorOccurred, &_port,
            [this](QSerialPort::SerialPortError kind) {
                if (kind != QSerialPort::NoError && kind != QSerialPort::TimeoutError)
                    lose(_port.errorString().toStdString());
            },
            Qt::QueuedConnection);
        return true;
    }

    void write(ByteView bytes) override
    {
        if (_port.bytesToWrite() + static_cast<qint64>(bytes.size()) > longestBacklog) {
            QMetaObject::invokeMethod(
                &_port, [this] { lose("the device takes nothing"); }, Qt::QueuedConnection);
            return;
        }
        _port.write(reinterpret_cast<const char*>(bytes.data()), static_cast<qint64>(bytes.size()));
    }

    void flush(std::chrono::milliseconds longest) override
    {
        QDeadlineTimer deadline(longest);
        while (_port.bytesToWrite() > 0 &&
               _port.waitForBytesWritten(static_cast<int>(deadline.remainingTime()))) {
        }
    }

  private:
    void read()
    {
        const QByteArray bytes = _port.readAll();
        if (!_isLost)
            _events.received({reinterpret_cast<const std::uint8_t*>(bytes.constData()),
                              static_cast<std::size_t>(bytes.size())});
    }

    void lose(const std::string& reason)
    {
        if (!std::exchange(_isLost, true))
            _events.lost(reason);
    }

    Events _events;
    bool _isLost = false;
    QSerialPort _port;
};

} // namespace

std::unique_ptr<SerialPort> LinuxSerialPorts::open(const std::string& device,
                                                   SerialPort::Events events, std::string& error)
{
    auto port = std::make_unique<LinuxSerialPort>(std::move(events));
    if (!port->open(device, error))
        return nullptr;
    return port;
}

} // namespace ventrik
