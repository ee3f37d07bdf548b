#include "Tools/OpenedCapture.h"

#include "LogGenerator/Core/AssertionFailure.h"
#include "Tools/ChosenTechnology.h"

#include <chrono>
#include <filesystem>
#include <new>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

using namespace std::chrono_literals;

// As long as the window may take to answer.
constexpr auto readingTime = 30ms;
constexpr std::size_t messagesBetweenLooks = 64;

} // namespace

std::unique_ptr<OpenedCapture> OpenedCapture::open(const OpenedCaptureOptions& options,
                                                   const Platform& platform, std::string& error)
{
    std::error_code unknown;
    if (std::filesystem::is_other(std::filesystem::status(options.capture, unknown))) {
        error = options.capture + ": it is no file"; // waiting for it would hold up the window
        return nullptr;
    }
    auto reader = CaptureReader::open(options.capture, error);
    if (!reader)
        return nullptr;
    const ChosenTechnology chosen = chooseTechnology(options.capture, options.technology, *reader);
    if (!chosen.technology) {
        error = chosen.remark;
        return nullptr;
    }
    std::unique_ptr<OpenedCapture> opened(
        new OpenedCapture(options, std::move(*reader), *chosen.technology, platform));
    opened->_remark = chosen.remark;
    return opened;
}

OpenedCapture::OpenedCapture(const OpenedCaptureOptions& options, CaptureReader reader,
                             const Technology& technology, const Platform& platform)
    : _capture(options.capture),
      _reader(std::move(reader)),
      _technology(technology),
      _clock(platform.clock),
      _generator(LogGenerator::generatorFromTechnology(
          technology.identifier, {platform.log, platform.resources, _clock, AssertionPolicy::Throw,
                                  options.records, RawPackets::Dropped}))
{
    _decoder.emplace(*_generator, _clock, OfflineDecoder::History::NotWanted);
}

void OpenedCapture::setObserver(MessageObserver& observer)
{
    _observer = &observer;
    observer.useGenerator(_generator.get(), _technology.name);
}

std::string OpenedCapture::name() const
{
    return std::filesystem::path(_capture).filename();
}

std::string OpenedCapture::progress() const
{
    return fmt::format("{} messages", _messages);
}

bool OpenedCapture::readOn()
{
    const auto end = std::chrono::steady_clock::now() + readingTime;
    try {
        do {
            for (std::size_t i = 0; i < messagesBetweenLooks; ++i)
                if (!readOne())
                    return false;
        } while (std::chrono::steady_clock::now() < end);
        return true;
    } catch (const AssertionFailure& failure) {
        _fault = fmt::format("{}: message {}: {}", _capture, _messages, failure.what());
    } catch (const std::bad_alloc&) {
        _fault = fmt::format("{}: message {}: out of memory", _capture, _messages);
    }
    return false;
}

// The end, and damage, tell what was wrong on the way.
bool OpenedCapture::readOne()
{
    const auto message = _reader.next();
    if (!message) {
        const auto notes = _reader.notes();
        _fault = !_reader.error().empty() ? _reader.error()
                 : !notes.empty()         ? notes.front()
                                          : _decoder->displayFault();
        return false;
    }
    _decoder->take(*message);
    ++_messages;
    if (_observer)
        _observer->messageTaken(message->time, message->data, _decoder->state());
    return true;
}

} // namespace ventrik
