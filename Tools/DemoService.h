#pragma once

#include "Packets/Layouts.h"
#include "Tools/DemoDirectory.h"

#include <string>

#include <QProcess>

namespace ventrik
{

/// A telephony service of our own, in a runtime directory that nobody else uses. It ends with this
/// process, however that ends; when it ends by itself, so does the event loop, with failure.
class DemoService
{
  public:
    ~DemoService();
    /// Waits until the service listens; false when it does not come up, which is then told on
    /// standard error. The directory outlives the service.
    bool start(const DemoDirectory& directory, const std::string& technology, RecordsMode records);

  private:
    bool waitUntilListening(const std::string& runtimeDirectory);
    void tellEnd();

    QProcess _process;
};

} // namespace ventrik
