#pragma once

#include "Tools/OwnDirectory.h"

#include <string>
#include <utility>

#include <QProcess>
#include <QStringList>

namespace ventrik
{

/// Which service it is to be.
struct OwnServiceOptions {
    std::string name; ///< what it is called on standard error, as in "demo"
    QStringList arguments;
};

/// A telephony service of our own, in a runtime directory that nobody else uses. It ends with this
/// process, however that ends; when it ends by itself, so does the event loop, with failure. What
/// it complains about while it serves is said on our standard error, too.
class OwnService
{
  public:
    explicit OwnService(OwnServiceOptions options) : _options(std::move(options)) {}
    ~OwnService();

    /// Waits until the service listens; false when it does not come up, which is then told on
    /// standard error. The directory outlives the service.
    bool start(const OwnDirectory& directory);

  private:
    bool waitUntilListening(const std::string& runtimeDirectory);
    void takeComplaints();
    std::string lastWords() const;
    void tellEnd();

    OwnServiceOptions _options;
    QProcess _process;
    bool _serves = false;
    std::string _complaints; // of which the last line may be unfinished
};

} // namespace ventrik
