#include "Tools/DecodeCommand.h"

#include "Capture/SnapshotFile.h"
#include "Files/PrivateFile.h"
#include "LogGenerator/Core/AssertionFailure.h"
#include "LogGenerator/Core/DateText.h"
#include "Model/TreePrinter.h"
#include "Platform/Linux/LinuxClock.h"
#include "Platform/Linux/LinuxResources.h"
#include "Platform/Linux/StandardStreams.h"
#include "Tools/ConsoleSystemLog.h"
#include "Tools/FileSystemLog.h"
#include "Tools/Json.h"
#include "Tools/OfflineDecoder.h"
#include "Tools/RecordReports.h"

#include <array>
#include <atomic>
#include <cerrno>
#include <memory>
#include <new>

#include <fmt/format.h>
#include <unistd.h>

namespace ventrik
{

namespace
{

// Freed when memory is out, for telling so and for the result.
constexpr std::size_t reserveSize = std::size_t{1} << 20;

std::atomic<bool> interrupted = false;
static_assert(std::atomic<bool>::is_always_lock_free);

// Whoever reads the decoder's output sets its pace, here as for the result.
void show(std::string_view text)
{
    writeText(STDERR_FILENO, text, Patience::Endless);
}

void complain(std::string_view text)
{
    ventrik::complain("ventrik-decode", text, Patience::Endless);
}

/// How far the decoder has come, on standard error while that is a terminal.
class Progress
{
  public:
    ~Progress()
    {
        if (_shown)
            show("\r\033[K");
    }

    void count(std::size_t messages)
    {
        if (messages % interval != 0 || !isatty(STDERR_FILENO))
            return;
        show(fmt::format("\r{} messages", messages));
        _shown = true;
    }

  private:
    static constexpr std::size_t interval = 10000;
    bool _shown = false;
};

class Decoding
{
  public:
    Decoding(const DecodeOptions& options, CaptureReader& reader, LogGenerator& generator,
             CaptureClock& clock, const Technology& technology, std::FILE* output)
        : _options(options),
          _reader(reader),
          _clock(clock),
          _technology(technology),
          _output(output),
          _decoder(generator, clock),
          _census(options.records)
    {
    }

    int run()
    {
        readAll();
        writeResult();
        int status = DecodeStatus::done;
        // An interrupted read looks like damage, and is none.
        if (!_failure.empty() && !interrupted) {
            complain(_failure);
            status = DecodeStatus::badInput;
        }
        if (const std::string fault = _decoder.displayFault(); !fault.empty()) {
            complain(fault);
            status = DecodeStatus::badInput;
        }
        if (std::fflush(_output) != 0)
            noteOutputError();
        // An interrupted write is no failure of the output's.
        if (_outputError != 0 && !(interrupted && _outputError == EINTR))
            status = tellOutputFailure("ventrik-decode", "writing the result", _outputError);
        if (!writeSnapshotFile())
            status = DecodeStatus::badInput;
        tellAboutRecords();
        return interrupted ? DecodeStatus::interrupted : status;
    }

  private:
    // What was decoded before a message that cannot be decoded is still the result.
    void readAll()
    {
        auto reserve = std::make_unique<std::array<char, reserveSize>>();
        try {
            readMessages();
            _decoder.finish();
        } catch (const AssertionFailure& failure) {
            _failure =
                fmt::format("{}: message {}: {}", _options.capture, _packets, failure.what());
            _decoder.finish();
        } catch (const std::bad_alloc&) {
            reserve.reset();
            _failure = fmt::format("{}: message {}: out of memory", _options.capture, _packets);
        }
    }

    void readMessages()
    {
        Progress progress;
        while (!interrupted && _outputError == 0) {
            const auto message = _reader.next();
            if (!message) {
                _failure = _reader.error();
                return;
            }
            if (isOfOtherSubscription(*message))
                continue;
            _decoder.take(*message);
            count(*message);
            if (_options.format == DecodeFormat::JsonLines)
                writeLine(*message);
            progress.count(++_packets);
        }
    }

    bool isOfOtherSubscription(const CapturedMessage& message) const
    {
        return _options.subscription && message.subscription &&
               *message.subscription != *_options.subscription;
    }

    void count(const CapturedMessage& message)
    {
        if (_options.statistics)
            _census.take(message.data);
        if (_options.records != RecordsMode::Extended && message.data.size() >= logPacketHeaderSize)
            _extensionCount += isExtensionOnly(LogPacket(stripPrefix(message.data))) ? 1 : 0;
    }

    // Only where there is something that the result cannot tell.
    void tellAboutRecords()
    {
        for (const std::string& note : _reader.notes())
            complain(note);
        for (const ReadLayout& layout : _decoder.layouts())
            if (layout.kind == LayoutKind::NotKnown)
                complain(fmt::format("{}: {}", _options.capture, warningOf(layout)));
        if (_extensionCount > 0)
            complain(fmt::format("{}: {} records that only --records extended decodes",
                                 _options.capture, _extensionCount));
        if (_options.statistics)
            show(recordTable(_census));
    }

    void appendDisplay()
    {
        if (const PlistValue* display = _decoder.display())
            appendJson(_text, *display);
        else
            _text += "null";
    }

    void write()
    {
        if (std::fwrite(_text.data(), 1, _text.size(), _output) != _text.size())
            noteOutputError();
        _text.clear();
    }

    // The first failure is the one to tell.
    void noteOutputError()
    {
        if (_outputError == 0)
            _outputError = errno;
    }

    void writeLine(const CapturedMessage& message)
    {
        const auto seconds = std::chrono::floor<std::chrono::seconds>(message.time);
        const auto rest = (message.time - seconds).count();
        fmt::format_to(std::back_inserter(_text), "{{\"packet\": {}, \"time\": ", _packets);
        // Whole microseconds are written as such: most captures have no finer times.
        if (rest % 1000 == 0)
            fmt::format_to(std::back_inserter(_text), "{}.{:06}",
                           seconds.time_since_epoch().count(), rest / 1000);
        else
            fmt::format_to(std::back_inserter(_text), "{}.{:09}",
                           seconds.time_since_epoch().count(), rest);
        _text += ", \"display\": ";
        appendDisplay();
        _text += "}\n";
        write();
    }

    void writeResult()
    {
        if (_options.format == DecodeFormat::Json) {
            fmt::format_to(std::back_inserter(_text),
                           "{{\"technology\": \"{}\", \"packets\": {}, \"display\": ",
                           _technology.name, _packets);
            appendDisplay();
            _text += "}\n";
        } else if (_options.format == DecodeFormat::Text) {
            PathIndex index;
            _text = printTree(*VentrikModelNode::makeTreeFromObject(_decoder.display(), index));
        }
        write();
    }

    bool writeSnapshotFile()
    {
        if (!_options.snapshotFile)
            return true;
        const auto snapshot =
            makeSnapshot(dateText(_clock.now()), _decoder.saveContents(), _options.description);
        const auto writing = writeSnapshot(snapshot, *_options.snapshotFile);
        if (!writing)
            complain(writing.error);
        else if (writing.replaced > 0)
            complain(fmt::format("{}: {} characters that XML cannot carry are written as U+FFFD",
                                 *_options.snapshotFile, writing.replaced));
        return static_cast<bool>(writing);
    }

    const DecodeOptions& _options;
    CaptureReader& _reader;
    CaptureClock& _clock;
    Technology _technology;
    std::FILE* _output;
    int _outputError = 0;
    OfflineDecoder _decoder;
    RecordCensus _census;
    std::size_t _extensionCount = 0; // of records that the present mode leaves aside
    std::size_t _packets = 0;
    std::string _text;
    std::string _failure; // what ended the reading, in one line; empty at the capture's end
};

std::optional<Technology> chooseTechnology(const DecodeOptions& options, CaptureReader& reader)
{
    if (options.technology)
        return options.technology;
    if (const auto technology = reader.technology())
        return technology;
    if (const auto type = reader.linkType()) {
        complain(fmt::format("{}: link type {} names no technology; say which with --technology",
                             options.capture, *type));
        return std::nullopt;
    }
    const auto guess = reader.guessTechnology();
    complain(guess ? fmt::format("{}: by its records it is of {}", options.capture, guess->name)
                   : fmt::format("{}: no record tells the technology; say which with --technology",
                                 options.capture));
    return guess;
}

int decodeWithLog(const DecodeOptions& options, SystemLog& log, std::FILE* output)
{
    std::string error;
    auto reader = CaptureReader::open(options.capture, error);
    if (!reader && interrupted)
        return DecodeStatus::interrupted;
    if (!reader) {
        complain(error);
        return DecodeStatus::badInput;
    }
    const auto technology = chooseTechnology(options, *reader);
    if (!technology)
        return DecodeStatus::badUsage;

    const LinuxResources resources(options.resourceDirectories.empty()
                                       ? LinuxResources::defaultDirectories()
                                       : options.resourceDirectories,
                                   options.version);
    const LinuxClock systemClock;
    CaptureClock clock(systemClock);
    const auto generator = LogGenerator::generatorFromTechnology(
        technology->identifier, {log, resources, clock, AssertionPolicy::Throw, options.records});
    if (!generator) {
        complain(fmt::format("{}: there is no decoder for the technology {}", options.capture,
                             technology->name));
        return DecodeStatus::badInput;
    }
    return Decoding(options, *reader, *generator, clock, *technology, output).run();
}

} // namespace

int decodeCapture(const DecodeOptions& options, std::FILE* output)
try {
    const int shownLevel = options.verbose ? options.logLevel : ConsoleSystemLog::showNothing;
    if (!options.systemLogFile) {
        ConsoleSystemLog log("ventrik-decode", shownLevel);
        return decodeWithLog(options, log, output);
    }
    std::string error;
    const auto log = FileSystemLog::create(*options.systemLogFile, error);
    if (!log) {
        complain(error);
        return DecodeStatus::badInput;
    }
    ConsoleSystemLog both("ventrik-decode", shownLevel, log.get());
    const int status = decodeWithLog(options, both, output);
    if (log->commit(error))
        return status;
    complain(error);
    return DecodeStatus::badInput;
} catch (const std::bad_alloc&) {
    complain(fmt::format("{}: out of memory", options.capture));
    return DecodeStatus::badInput;
}

namespace
{

// False when it could not be read to its end.
bool countRecords(const std::string& capture, RecordCensus& census)
{
    std::string error;
    auto reader = CaptureReader::open(capture, error);
    Progress progress;
    std::size_t count = 0;
    for (bool isMore = reader.has_value(); isMore && !interrupted;) {
        const auto message = reader->next();
        if (message) {
            census.take(message->data);
            progress.count(++count);
        } else {
            error = reader->error();
            isMore = false;
        }
    }
    for (const std::string& note : reader ? reader->notes() : std::vector<std::string>())
        complain(note);
    if (!error.empty() && !interrupted)
        complain(error);
    return error.empty();
}

} // namespace

int reportUnknownRecords(const UnknownReportOptions& options)
{
    RecordCensus census(RecordsMode::Extended);
    bool isWhole = true;
    for (const std::string& capture : options.captures)
        isWhole = !interrupted && countRecords(capture, census) && isWhole;
    if (interrupted)
        return DecodeStatus::interrupted;
    std::string error;
    auto file = PrivateFile::create(options.file, error);
    if (file)
        file->write(unknownRecordReport(census, options.withBytes));
    if (!file || !file->commit(error)) {
        complain(error);
        return DecodeStatus::badInput;
    }
    complain(reportNotice(options.file, options.withBytes));
    return isWhole ? DecodeStatus::done : DecodeStatus::badInput;
}

void interruptDecoding()
{
    interrupted = true;
}

} // namespace ventrik
