#include "TelephonyService/DiagnosticPort.h"

#include "Packets/LogPacket.h"
#include "TelephonyService/DiagnosticFrames.h"

#include <algorithm>
#include <unordered_set>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::chrono::milliseconds farewellTime{500};

} // namespace

/// One channel's part in the port.
class DiagnosticPort::Source : public MessageSource
{
  public:
    explicit Source(DiagnosticPort& port) : _port(port) {}
    ~Source() override { _port.remove(*this); }

    void start(const WantedCodes& wanted, Receiver receiver) override
    {
        _codes = wanted.codes();
        _receiver = std::move(receiver);
        _port.add(*this);
    }
    std::optional<TimedMessage> next() override { return std::nullopt; }
    PlistDictionary report() const override { return _port.report(); }

    void addTo(LogMasks& masks) const
    {
        for (const std::uint64_t code : _codes)
            if (code <= UINT16_MAX)
                masks.add(static_cast<std::uint16_t>(code));
    }
    /// Codes that no mask can ask for.
    std::ptrdiff_t otherCodeCount() const
    {
        return std::ranges::count_if(_codes, [](std::uint64_t code) { return code > UINT16_MAX; });
    }
    void receive(ByteView message) const { _receiver(message); }

  private:
    DiagnosticPort& _port;
    std::unordered_set<std::uint64_t> _codes;
    Receiver _receiver;
};

DiagnosticPort::DiagnosticPort(MainQueue& queue, SerialPorts& ports, SystemLog& log,
                               std::string device)
    : _queue(queue), _ports(ports), _log(log), _device(std::move(device))
{
}

DiagnosticPort::~DiagnosticPort()
{
    if (!_port)
        return;
    if (!_connection->masks.empty())
        _port->write(LogMasks::disablingCommand());
    // The last channel may have left just now: what was written then is still on its way.
    _port->flush(farewellTime);
    reportCounts();
}

void DiagnosticPort::open()
{
    std::string error;
    _port = _ports.open(_device,
                        {[this](ByteView bytes) { take(bytes); },
                         [this](const std::string& reason) { lose(reason); }},
                        error);
    if (!_port) {
        if (error != _lastFault)
            _log.error("{} cannot be opened, and is tried again every {} s: {}", _device,
                       retryDelay.count(), error);
        _lastFault = std::move(error);
        return retryLater();
    }
    _lastFault.clear();
    _log.warning("{} is open", _device);
    _connection = Connection{};
    updateMasks();
}

std::unique_ptr<MessageSource> DiagnosticPort::makeSource()
{
    return std::make_unique<Source>(*this);
}

void DiagnosticPort::add(Source& source)
{
    _sources.push_back(&source);
    if (const auto count = source.otherCodeCount(); count > 0)
        _log.warning("{}: {} of the codes are no log codes and cannot be asked for there", _device,
                     count);
    updateMasksSoon();
}

void DiagnosticPort::remove(Source& source)
{
    if (std::erase(_sources, &source) > 0)
        updateMasksSoon();
}

// A channel that begins anew leaves and comes back at once; the port need not know.
void DiagnosticPort::updateMasksSoon()
{
    if (!std::exchange(_willUpdateMasks, true))
        _queue.async(guarded(&DiagnosticPort::updateMasks));
}

void DiagnosticPort::updateMasks()
{
    _willUpdateMasks = false;
    if (!_port)
        return;
    LogMasks masks;
    for (const Source* source : _sources)
        source->addTo(masks);
    const auto commands = masks.commandsFrom(_connection->masks);
    for (const Bytes& command : commands)
        _port->write(command);
    if (_connection->masks.empty() && !masks.empty())
        _queue.after(answerTime, guarded(&DiagnosticPort::expectAnswer));
    _connection->masks = std::move(masks);
}

void DiagnosticPort::take(ByteView bytes)
{
    _connection->byteCount += bytes.size();
    while (!bytes.empty()) {
        bytes = bytes.subspan(_connection->frames.take(bytes));
        if (const auto frame = _connection->frames.frame())
            takeFrame(*frame);
    }
}

void DiagnosticPort::takeFrame(const HdlcFrame& frame)
{
    _connection->hasAnswered = true;
    if (takeAnswer(frame.content))
        return;
    const auto record = _connection->records.record(frame);
    if (!record)
        return;
    for (const Source* source : _sources)
        source->receive(record->data);
}

bool DiagnosticPort::takeAnswer(ByteView content)
{
    using namespace DiagnosticFrames;
    const std::uint8_t kind = content[0];
    if (kind == badCommand || kind == badParameters || kind == badLength) {
        refuse(fmt::format("it answers 0x{:02X}", kind));
        return true;
    }
    if (kind != logMaskCommand)
        return false;
    if (const auto status = LogPacket(content).u32(statusOffset); status != 0)
        refuse(fmt::format("status {}", status));
    else
        _connection->hasSetMasks = true;
    return true;
}

// A port that refuses one mask refuses the others as well.
void DiagnosticPort::refuse(std::string_view reason)
{
    if (!_connection->refusal.empty())
        return;
    _connection->refusal = reason;
    _log.error("{} refuses to send logs: {}", _device, reason);
}

void DiagnosticPort::expectAnswer()
{
    if (_port && !_connection->masks.empty() && !_connection->hasAnswered)
        _log.error("{} does not answer", _device);
}

void DiagnosticPort::lose(const std::string& reason)
{
    _log.error("{} has gone, and is tried again every {} s: {}", _device, retryDelay.count(),
               reason);
    _lastFault = fmt::format("has gone: {}", reason);
    _connection->frames.end();
    reportCounts();
    _connection.reset();
    // Not at once: the port must not be let go of while it tells of its end.
    _queue.async([port = std::shared_ptr<SerialPort>(std::move(_port))] {});
    retryLater();
}

void DiagnosticPort::retryLater()
{
    _queue.after(retryDelay, guarded(&DiagnosticPort::open));
}

void DiagnosticPort::reportCounts()
{
    std::vector<std::string> lines;
    _connection->frames.tell(lines, _device);
    _connection->records.tell(lines, _device);
    for (const std::string& line : lines)
        _log.error("{}", line);
}

PlistDictionary DiagnosticPort::report() const
{
    PlistDictionary report{{"Device", _device}, {"State", _port ? "open" : _lastFault}};
    if (!_connection)
        return report;
    report.set("Log Masks", maskState());
    report.set("Bytes Received", fmt::format("{}", _connection->byteCount));
    _connection->records.addTo(report);
    _connection->frames.addTo(report);
    return report;
}

std::string DiagnosticPort::maskState() const
{
    if (!_connection->refusal.empty())
        return fmt::format("refused: {}", _connection->refusal);
    if (_connection->masks.empty())
        return "not asked for";
    return _connection->hasSetMasks ? "set" : "asked for, not answered yet";
}

MainQueue::Task DiagnosticPort::guarded(void (DiagnosticPort::*operation)())
{
    return [alive = std::weak_ptr(_alive), this, operation] {
        if (alive.lock())
            (this->*operation)();
    };
}

} // namespace ventrik
