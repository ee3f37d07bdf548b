#pragma once

#include "App/DateFormatter.h"
#include "App/TimeLine.h"
#include "Model/OpenedSource.h"
#include "Platform/Platform.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace ventrik
{

/// Reads an opened capture into the store while the window lives, and shows the newest of it as
/// long as nobody looks at something else.
class CaptureReading
{
  public:
    /// All outlive it.
    CaptureReading(std::shared_ptr<OpenedSource> source, const Platform& platform,
                   ChangeStore& store, TimeLine& timeLine);

    /// Begins; `progressed` is called now and then, and at the end.
    void start(std::function<void()> progressed);
    bool isReading() const { return _isReading; }
    std::string name() const { return _source->name(); }
    /// Its end, as far as it is read.
    void showEnd();
    /// What is shown of it, or how far it is read.
    std::string status() const;
    /// What is wrong with it, or is not held of it; empty while it is read and where all is well.
    std::string note() const;

  private:
    void readOnLater();
    void readOn();

    std::shared_ptr<OpenedSource> _source;
    Platform _platform;
    ChangeStore& _store;
    TimeLine& _timeLine;
    DateFormatter _times;
    std::function<void()> _progressed;
    bool _isReading = false;
    std::optional<Clock::TimePoint> _lastUpdate;
    std::optional<Clock::TimePoint> _shownEnd;
    std::shared_ptr<char> _life = std::make_shared<char>(); // what waits in the queue ends with it
};

} // namespace ventrik
