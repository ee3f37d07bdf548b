#include "Model/ChannelPane.h"

#include "Model/ChannelNote.h"
#include "Model/CodeReport.h"
#include "Model/NodeRows.h"

#include <algorithm>
#include <chrono>
#include <utility>

#include <fmt/format.h>
#include <fmt/ranges.h>

namespace ventrik
{

namespace
{

constexpr std::string_view rowName = "Channel";

std::string number(std::size_t count)
{
    return fmt::format("{}", count);
}

PlistDictionary rowsOfCode(const CodeReport::Code& code)
{
    PlistDictionary rows;
    if (const auto name = nameOfCode(code.logCode); !name.empty())
        rows.set("Name", std::string(name));
    rows.set("Records", number(code.records));
    if (!code.sections.empty())
        rows.set("Sections", fmt::format("{}", fmt::join(code.sections, ", ")));
    if (!code.versions.empty())
        rows.set("Versions", versionsText(code));
    rows.set("Too Short", number(code.tooShort));
    PlistDictionary kinds;
    for (const auto& [kind, count] : code.kinds)
        kinds.set(kindText(kind), number(count));
    rows.set("Layouts", kinds);
    return rows;
}

void addCodes(PlistDictionary& rows, const CodeReport& report)
{
    PlistDictionary counts;
    PlistDictionary details;
    PlistDictionary missing;
    PlistDictionary undecoded;
    for (const CodeReport::Code& code : report.came) {
        (code.isAskedFor ? counts : undecoded).set(codeText(code.logCode), number(code.records));
        details.set(codeText(code.logCode), rowsOfCode(code));
    }
    for (const std::uint32_t code : report.missing)
        missing.set(codeText(code), std::string(nameOfCode(code)));
    rows.set("Records by Code", counts);
    rows.set("About Each Code", details);
    rows.set("Asked For, Never Came", missing);
    rows.set("Came, Nobody Decodes", undecoded);
}

} // namespace

void ChannelCounts::useGenerator(const LogGenerator* generator, std::string_view technology)
{
    if (generator && std::exchange(_technology, technology) != technology)
        _census = RecordCensus(_records);
}

void ChannelCounts::messageTaken(Clock::TimePoint, ByteView message, const PlistDictionary&)
{
    ++_messages;
    _bytes += message.size();
    _census.take(message);
}

ChannelPane::ChannelPane(VentrikModel& model, const ChannelCounts& counts, const Clock& clock)
    : _model(model), _counts(counts), _clock(clock)
{
}

void ChannelPane::show()
{
    const PlistValue object = PlistDictionary{{std::string(rowName), rows()}};
    _nodesByPath.emplace();
    _node = rowsOf(VentrikModelNode::makeTreeFromObject(&object, *_nodesByPath)).front();
}

void ChannelPane::hide()
{
    _node.reset();
    _nodesByPath.reset();
}

bool ChannelPane::toggle(const std::string& path)
{
    const bool leaves = holds(path);
    if (leaves && !_isKept)
        hide();
    else
        show();
    return !leaves;
}

void ChannelPane::update()
{
    if (isShown())
        show();
}

ModelNodePointer ChannelPane::topLevelNodes()
{
    if (!isShown())
        return _display;
    VentrikModelNode::Children rows = rowsOf(_display);
    rows.push_back(_node);
    return VentrikModelTreeNode::initWithName("Ventrik", std::move(rows));
}

ModelNodePointer ChannelPane::nodeAtPath(const std::string& path)
{
    return holds(path) ? _nodesByPath->find(path) : _model.nodeAtPath(path);
}

std::string_view ChannelPane::doubtAt(const std::string& path) const
{
    return holds(path) ? std::string_view() : _model.doubtAt(path);
}

std::vector<std::string> ChannelPane::layoutWarningsAt(const std::string& path) const
{
    return holds(path) ? std::vector<std::string>() : _model.layoutWarningsAt(path);
}

bool ChannelPane::holds(const std::string& path) const
{
    const std::string_view own(ChannelPane::rowPath);
    return isShown() && path.starts_with(own) &&
           (path.size() == own.size() || path[own.size()] == '/');
}

PlistDictionary ChannelPane::rows()
{
    PlistDictionary rows{{"State", stateText()}};
    if (!_model.technologyName().empty())
        rows.set("Technology", std::string(_model.technologyName()));
    rows.set("Messages", number(_counts.messages()));
    rows.set("Bytes", number(_counts.bytes()));
    rows.set("Last Message", lastMessageText());
    rows.set("Times Opened", number(_model.timesOpened()));
    rows.set("Last Error", troubleText());
    if (const std::string fault = _model.displayFault(); !fault.empty())
        rows.set("Display", fault);
    if (const auto report = _model.askServiceReport())
        rows.set("Service", *report);
    else
        rows.set("Service", "tells nothing");
    addCodes(rows, CodeReport::of(_counts.census(), _model.generator()));
    if (_counts.census().brokenCount() > 0)
        rows.set("Messages That Are No Records", number(_counts.census().brokenCount()));
    return rows;
}

std::string ChannelPane::stateText() const
{
    if (const auto since = _model.connectedSince())
        return fmt::format("open since {}", timeOfDay(_clock, *since));
    const std::string_view fault = channelFaultText(_model.channelFault());
    return fault.empty() ? "not open yet" : std::string(fault);
}

std::string ChannelPane::lastMessageText() const
{
    const auto time = _model.lastMessageTime();
    if (!time)
        return "none";
    const auto ago = std::chrono::floor<std::chrono::seconds>(
        std::max(_clock.now() - *time, Clock::TimePoint::duration::zero()));
    return fmt::format("{}, {} s ago", timeOfDay(_clock, *time), ago.count());
}

std::string ChannelPane::troubleText() const
{
    const auto& trouble = _model.lastTrouble();
    return trouble ? fmt::format("{}: {}", timeOfDay(_clock, trouble->time), trouble->text)
                   : "none";
}

} // namespace ventrik
