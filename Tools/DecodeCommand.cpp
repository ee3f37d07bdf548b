#include "Tools/DecodeCommand.h"

#include "Capture/CaptureFile.h"
#include "Capture/SnapshotFile.h"
#include "Files/PrivateFile.h"
#include "LogGenerator/Core/AssertionFailure.h"
#include "LogGenerator/Core/DateText.h"
#include "Model/TreePrinter.h"
#include "Platform/Linux/LinuxClock.h"
#include "Platform/Linux/LinuxResources.h"
#include "Platform/Linux/StandardStreams.h"
#include "PropertyList/Json.h"
#include "Report/CaptureReport.h"
#include "Tools/ChosenTechnology.h"
#include "Tools/ConsoleSystemLog.h"
#include "Tools/FileSystemLog.h"
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
    explicit Progress(bool isWanted) : _isWanted(isWanted) {}
    ~Progress()
    {
        if (_shown)
            show("\r\033[K");
    }

    void count(std::size_t messages)
    {
        if (messages % interval != 0 || !_isWanted || !isatty(STDERR_FILENO))
            return;
        show(fmt::format("\r{} messages", messages));
        _shown = true;
    }

  private:
    static constexpr std::size_t interval = 10000;
    bool _isWanted;
    bool _shown = false;
};

// Rows and reports tell all that changes by themselves. The log tells of the history, too.
bool wantsHistory(const DecodeOptions& options)
{
    const bool tellsChanges =
        options.format == DecodeFormat::Rows || options.format == DecodeFormat::Html;
    return !tellsChanges || options.snapshotFile || options.systemLogFile || options.verbose;
}

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
          _decoder(generator, clock,
                   wantsHistory(options) ? OfflineDecoder::History::Kept
                                         : OfflineDecoder::History::NotWanted),
          _census(options.records)
    {
        if (options.format == DecodeFormat::Rows)
            _rows.emplace(options.rows, options.capture, technology, generator, options.records);
        if (options.format == DecodeFormat::Html)
            _report.emplace(generator, technology, options.records);
    }

    int run()
    {
        if (!openCapture())
            return DecodeStatus::badInput;
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
        if (!writeSnapshotFile() || !commitCapture())
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
        Progress progress(_options.showsProgress);
        while (!interrupted && _outputError == 0) {
            const auto message = _reader.next();
            if (!message) {
                _failure = _reader.error();
                return;
            }
            if (isOfOtherSubscription(*message))
                continue;
            if (_rows)
                _rows->runStepsBefore(message->time, _decoder.state());
            _decoder.take(*message);
            count(*message);
            if (_rows)
                writeRows(*message);
            else if (_report)
                _report->take(message->time, message->data, _decoder.state());
            else if (_options.format == DecodeFormat::JsonLines)
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
        _bytes += message.data.size();
        _lastTime = message.time;
        if (_capture && message.data.size() > CaptureFile::maximumMessageSize)
            ++_oversizedCount;
        else if (_capture)
            _capture->write(message.time, message.data);
        const bool mayBeExtension =
            _options.records != RecordsMode::Extended && !_decoder.generator().lastRead();
        if (mayBeExtension && message.data.size() >= logPacketHeaderSize)
            _extensionCount += isExtensionOnly(LogPacket(stripPrefix(message.data))) ? 1 : 0;
    }

    std::vector<std::string> recordRemarks() const
    {
        std::vector<std::string> remarks;
        for (const ReadLayout& layout : _decoder.layouts())
            if (layout.kind == LayoutKind::NotKnown)
                remarks.push_back(fmt::format("{}: {}", _options.capture, warningOf(layout)));
        if (_extensionCount > 0)
            remarks.push_back(fmt::format("{}: {} records that only --records extended decodes",
                                          _options.capture, _extensionCount));
        return remarks;
    }

    // Only where there is something that the result cannot tell.
    void tellAboutRecords()
    {
        for (const std::string& note : _reader.notes())
            complain(note);
        for (const std::string& remark : recordRemarks())
            complain(remark);
        if (_options.statistics) {
            show(fmt::format("{}: {} messages of {} bytes", _options.capture, _packets, _bytes));
            if (_lastTime)
                show(fmt::format(", the last at {}", dateText(*_lastTime)));
            show("\n" + recordTable(_census) +
                 codeTable(CodeReport::of(_census, &_decoder.generator())));
        }
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
        write(_text);
        _text.clear();
    }

    void write(std::string_view text)
    {
        if (std::fwrite(text.data(), 1, text.size(), _output) != text.size())
            noteOutputError();
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

    void writeRows(const CapturedMessage& message)
    {
        constexpr std::size_t blockSize = 65536;
        _rows->take(message, _decoder.state());
        if (_rows->text().size() >= blockSize)
            flushRows();
    }

    void flushRows()
    {
        write(_rows->text());
        _rows->clearText();
    }

    void closeRows()
    {
        _rows->finish(_decoder.state());
        RowClosing closing = _rows->closing();
        const auto notes = _reader.notes();
        const std::string reason =
            !_failure.empty() ? _failure : (notes.empty() ? std::string() : notes.front());
        closing.reason = reason;
        closing.status = !reason.empty() ? "damaged" : (closing.records == 0 ? "empty" : "ok");
        if (!_failure.empty())
            closing.offset = _reader.errorOffset();
        if (!interrupted)
            _rows->close(closing);
        flushRows();
    }

    void writeReport()
    {
        ReportFacts facts{.capture = _options.capture,
                          .technology = {},
                          .notes = reportNotes(),
                          .program = "Ventrik " + _options.version};
        if (const auto first = _report->firstTime())
            facts.secondsFromUtc = _clock.timeZone(*first).secondsFromUtc;
        write(_report->page(std::move(facts)));
    }

    std::vector<std::string> reportNotes() const
    {
        std::vector<std::string> notes;
        if (!_failure.empty() && !interrupted)
            notes.push_back(_failure);
        if (interrupted)
            notes.push_back("Decoding was interrupted: the report tells of what came before.");
        const auto skipped = _reader.notes();
        notes.insert(notes.end(), skipped.begin(), skipped.end());
        const auto remarks = recordRemarks();
        notes.insert(notes.end(), remarks.begin(), remarks.end());
        return notes;
    }

    void writeResult()
    {
        if (_rows)
            return closeRows();
        if (_report)
            return writeReport();
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

    // Before anything is decoded that could not be kept.
    bool openCapture()
    {
        if (!_options.captureToWrite)
            return true;
        std::string error;
        _capture =
            CaptureFile::create(*_options.captureToWrite, _technology, _options.version, error);
        if (!_capture)
            complain(error);
        return _capture != nullptr;
    }

    bool commitCapture()
    {
        std::string error;
        if (!_capture || _capture->commit(error)) {
            if (_oversizedCount > 0)
                complain(fmt::format("{}: {} messages are too large for a capture and left out",
                                     *_options.captureToWrite, _oversizedCount));
            return true;
        }
        complain(error);
        return false;
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
    std::optional<CaptureRows> _rows;      // where they are wanted
    std::optional<CaptureReport> _report;  // likewise
    std::unique_ptr<CaptureFile> _capture; // likewise
    std::size_t _oversizedCount = 0;       // of messages that no capture takes
    RecordCensus _census;
    std::size_t _extensionCount = 0; // of records that the present mode leaves aside
    std::size_t _packets = 0;
    std::size_t _bytes = 0; // of them
    std::optional<Clock::TimePoint> _lastTime;
    std::string _text;
    std::string _failure; // what ended the reading, in one line; empty at the capture's end
};

// Of a capture that nothing can be read of.
int refuse(const DecodeOptions& options, const std::string& reason, int status, std::FILE* output)
{
    complain(reason);
    if (options.format == DecodeFormat::Rows) {
        std::string row;
        RowWriter::create(options.rows.format, options.capture, {})
            ->appendClosing(row, {.status = "damaged", .reason = reason});
        std::fwrite(row.data(), 1, row.size(), output);
    }
    return status;
}

int decodeWithLog(const DecodeOptions& options, SystemLog& log, std::FILE* output)
{
    std::string error;
    auto reader = CaptureReader::open(options.capture, error);
    if (!reader && interrupted)
        return DecodeStatus::interrupted;
    if (!reader)
        return refuse(options, error, DecodeStatus::badInput, output);
    const auto [technology, remark] =
        chooseTechnology(options.capture, options.technology, *reader);
    if (!technology)
        return refuse(options, remark, DecodeStatus::badUsage, output);
    if (!remark.empty())
        complain(remark);

    const LinuxResources resources(options.resourceDirectories.empty()
                                       ? LinuxResources::defaultDirectories()
                                       : options.resourceDirectories,
                                   options.version);
    const LinuxClock systemClock;
    CaptureClock clock(systemClock);
    const auto generator = LogGenerator::generatorFromTechnology(
        technology->identifier, {log, resources, clock, AssertionPolicy::Throw, options.records,
                                 wantsHistory(options) ? RawPackets::Kept : RawPackets::Dropped});
    if (!generator)
        return refuse(options,
                      fmt::format("{}: there is no decoder for the technology {}", options.capture,
                                  technology->name),
                      DecodeStatus::badInput, output);
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
    Progress progress(true);
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
    RecordCensus census(RecordsMode::Extended, RecordCensus::Payloads::Kept);
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

bool isDecodingInterrupted()
{
    return interrupted;
}

} // namespace ventrik
