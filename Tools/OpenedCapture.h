#pragma once

#include "Capture/CaptureReader.h"
#include "Model/OpenedSource.h"
#include "Platform/Platform.h"
#include "Tools/OfflineDecoder.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

struct OpenedCaptureOptions {
    std::string capture; ///< a file
    std::optional<Technology> technology = {};
    RecordsMode records = RecordsMode::Newer;
};

/// A capture of any kind that an observer is told as if it came over the log channel, as fast as it
/// can be decoded.
class OpenedCapture : public OpenedSource
{
  public:
    /// None where nothing can be read of it; `error` says why in one line. The technology may have
    /// been guessed: then `remark` says so.
    static std::unique_ptr<OpenedCapture> open(const OpenedCaptureOptions& options,
                                               const Platform& platform, std::string& error);

    const std::string& remark() const { return _remark; }
    void setObserver(MessageObserver& observer) override;
    std::string name() const override;
    bool readOn() override;
    std::string progress() const override;
    std::string fault() const override { return _fault; }

  private:
    OpenedCapture(const OpenedCaptureOptions& options, CaptureReader reader,
                  const Technology& technology, const Platform& platform);

    bool readOne();

    std::string _capture;
    CaptureReader _reader;
    Technology _technology;
    std::string _remark;
    CaptureClock _clock;
    std::unique_ptr<LogGenerator> _generator;
    std::optional<OfflineDecoder> _decoder;
    MessageObserver* _observer = nullptr;
    std::size_t _messages = 0;
    std::string _fault;
};

} // namespace ventrik
