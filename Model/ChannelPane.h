#pragma once

#include "Model/DisplayTree.h"
#include "Model/MessageObserver.h"
#include "Model/VentrikModel.h"
#include "Packets/RecordCensus.h"

#include <optional>
#include <string>

namespace ventrik
{

/// Counts what comes over the log channel, of one technology.
class ChannelCounts : public MessageObserver
{
  public:
    explicit ChannelCounts(RecordsMode records) : _records(records), _census(records) {}

    std::size_t messages() const { return _messages; }
    std::size_t bytes() const { return _bytes; }
    const RecordCensus& census() const { return _census; }

    void useGenerator(const LogGenerator* generator, std::string_view technology) override;
    void messageTaken(Clock::TimePoint time, ByteView message,
                      const PlistDictionary& state) override;

  private:
    RecordsMode _records;
    std::string _technology;
    RecordCensus _census;
    std::size_t _messages = 0;
    std::size_t _bytes = 0;
};

/// The model's display tree with one more row at the end of its root: the channel, for those who
/// ask why nothing appears. The row is left out until it is asked for.
class ChannelPane : public DisplayTree
{
  public:
    static constexpr const char* rowPath = "/Channel";

    /// All outlive it. The counts observe the model.
    ChannelPane(VentrikModel& model, const ChannelCounts& counts, const Clock& clock);

    bool isShown() const { return _node != nullptr; }
    void show();
    void hide();
    /// The row stays from now on.
    void keep()
    {
        _isKept = true;
        show();
    }
    /// For the key that leads to the row and back, from what shows at a path: true where it leads
    /// to the row, which is shown then. Back at the root the row is left out again.
    bool toggle(const std::string& path);
    /// The model has news of its display.
    void takeDisplay() { _display = _model.topLevelNodes(); }
    /// Brings the channel's rows up to date, where they are shown. May wait for the service.
    void update();
    /// The path is that of the row, or of what it leads to; and it is shown.
    bool holds(const std::string& path) const;

    ModelNodePointer topLevelNodes() override;
    ModelNodePointer nodeAtPath(const std::string& path) override;
    std::string_view doubtAt(const std::string& path) const override;
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override;

  private:
    PlistDictionary rows();
    std::string stateText() const;
    std::string lastMessageText() const;
    std::string troubleText() const;

    VentrikModel& _model;
    const ChannelCounts& _counts;
    const Clock& _clock;
    ModelNodePointer _display; // the model's root, when it last had news
    ModelNodePointer _node;    // null while the row is left out
    bool _isKept = false;
    std::optional<PathIndex> _nodesByPath;
};

} // namespace ventrik
