#pragma once

#include "LogGenerator/Core/LogGenerator.h"
#include "Model/ChannelPane.h"
#include "Platform/Platform.h"
#include "Platform/SystemLog.h"
#include "Tools/LiveRows.h"
#include "Tools/MetricsFile.h"
#include "Tools/Recording.h"
#include "Tools/Watch/WatchViewer.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include <unistd.h>

namespace ventrik
{

struct WatchOptions {
    bool once = false;                      ///< ends after the first tree
    bool channelPane = false;               ///< the root ends with a row for the channel
    std::optional<std::string> metricsFile; ///< where numbers go at each refresh
    bool plain = false;                     ///< prints trees on a terminal, too
    std::optional<RowOptions> rows;         ///< prints rows instead
    RecordsMode records = RecordsMode::Newer;
    RecordingOptions recording;
    int logLevel = LogPriority::error;
    bool verbose = false;
};

/// `ventrik-watch`: the model with panes on a terminal, or with a tree printed at each refresh.
class WatchCommand
{
  public:
    explicit WatchCommand(const WatchOptions& options)
        : _options(options), _channelCounts(options.records)
    {
    }

    /// Runs the main loop to the end; gives the exit status. The application object exists.
    int run();

  private:
    bool showsPanes() const;
    std::unique_ptr<VentrikModel> makeModel(const Platform& platform);
    void refresh();
    void writeMetrics();
    void printTree();
    void printRows();
    bool print(std::string_view text) const;
    bool print(const VentrikModelNode& root) const;

    WatchOptions _options;
    int _output = STDOUT_FILENO;         // where the result goes
    std::optional<LiveRows> _rows;       // where they are printed
    std::optional<MetricsFile> _metrics; // where they are written
    std::string _metricsFault;           // why they were not, the last time; else empty
    ChannelCounts _channelCounts;
    std::unique_ptr<VentrikModel> _model;
    std::unique_ptr<ChannelPane> _tree;   // the model's, with a row for the channel
    std::unique_ptr<WatchViewer> _viewer; // none: trees are printed
};

} // namespace ventrik
