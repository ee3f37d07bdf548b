#pragma once

#include "Model/MessageObserver.h"
#include "Model/VentrikModel.h"

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// The numbers that the display shows and what the channel did, as a file that the node exporter of
/// Prometheus takes up. It is replaced whole at each writing; everybody may read it.
class MetricsFile : public MessageObserver
{
  public:
    /// Nothing is written before `write`.
    explicit MetricsFile(std::string path) : _path(std::move(path)) {}

    void useGenerator(const LogGenerator* generator, std::string_view technology) override;
    void messageTaken(Clock::TimePoint time, ByteView message,
                      const PlistDictionary& state) override;

    /// The file's text as things stand.
    std::string text(const VentrikModel& model) const;
    /// False, with the reason in one line, when it cannot be written; the file before stays then.
    bool write(const VentrikModel& model, std::string& error) const;

  private:
    /// The numbers of each metric by their labels, of which no two may be the same.
    using Metrics = std::map<std::string, std::map<std::string, double>>;
    using Keys = std::vector<std::string_view>;

    void addGroup(Metrics& metrics, const PlistValue& group, Keys& keys, int index) const;
    void addValue(Metrics& metrics, const PlistValue& group, const Keys& keys, int index,
                  std::string_view text) const;

    std::string _path;
    const LogGenerator* _generator = nullptr;
    std::string _technology;
    PlistDictionary _state;
    std::size_t _messages = 0;
    std::size_t _bytes = 0;
};

} // namespace ventrik
