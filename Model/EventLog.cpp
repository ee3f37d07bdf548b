#include "Model/EventLog.h"

#include "Model/DisplayNames.h"
#include "Model/EventPlaces.h"
#include "Platform/Technology.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <iterator>
#include <map>
#include <optional>
#include <utility>

#include <fmt/format.h>

namespace ventrik
{

namespace
{

constexpr std::string_view channelPane = "/Channel";
constexpr std::string_view elementMark = "/*";
// Of a longer list the rest is not named.
constexpr std::size_t mostNamed = 8;
constexpr std::size_t longestText = 120; // bytes

/// A list's values by the elements' numbers.
using ListedValues = std::map<std::size_t, std::string>;

std::string_view holderOf(std::string_view path)
{
    const std::size_t end = path.rfind('/');
    return end == 0 ? path.substr(0, 1) : path.substr(0, end);
}

bool isBelow(std::string_view path, std::string_view holder)
{
    return path.size() > holder.size() && path.starts_with(holder) && path[holder.size()] == '/';
}

bool isAtOrBelow(std::string_view path, std::string_view holder)
{
    return path == holder || isBelow(path, holder);
}

/// The list's path in that of its values.
std::string_view listOf(std::string_view path)
{
    return path.substr(0, path.find(elementMark));
}

/// What is behind the element in the path of a list's value.
std::string_view nameInElement(std::string_view path)
{
    return path.substr(path.rfind('/') + 1);
}

/// The number of the element that a path at or below one of the list's has in it.
std::size_t indexIn(std::string_view path, const EventPlace& place)
{
    std::size_t index = 0;
    path.remove_prefix(listOf(place.path).size() + 1);
    std::from_chars(path.data(), path.data() + path.size(), index);
    return index;
}

bool isValueOf(std::string_view path, const EventPlace& place)
{
    switch (place.shape) {
    case EventShape::Value:
        return path == place.path;
    case EventShape::Marked:
        return holderOf(path) == place.path;
    case EventShape::Group:
        return isAtOrBelow(path, place.path);
    case EventShape::Listed:
        return holderOf(holderOf(path)) == listOf(place.path) &&
               nameInElement(path) == nameInElement(place.path);
    }
    return false;
}

/// Whether a group or a list of the place goes, or a part of the list, where that path does.
bool isHolderOf(std::string_view path, const EventPlace& place)
{
    if (place.shape == EventShape::Group)
        return isAtOrBelow(place.path, path);
    return place.shape == EventShape::Listed &&
           (isAtOrBelow(listOf(place.path), path) || holderOf(path) == listOf(place.path) ||
            isValueOf(path, place));
}

std::string_view paneOf(const EventPlace& place)
{
    switch (place.shape) {
    case EventShape::Value:
        return holderOf(place.path);
    case EventShape::Listed:
        return listOf(place.path);
    case EventShape::Group:
    case EventShape::Marked:
        break;
    }
    return place.path;
}

std::string textOf(const ListedValues& values)
{
    std::string text;
    std::size_t named = 0;
    for (const auto& [index, value] : values) {
        if (named++ == mostNamed)
            return text + ", …";
        text += (text.empty() ? "" : ", ") + value;
    }
    return text.empty() ? "none" : text;
}

std::string displayNameOf(std::string_view technology)
{
    const auto known = technologyNamed(technology);
    return std::string(known ? known->displayName : technology);
}

std::string joined(std::string first, const std::string& second)
{
    return first + (first.empty() || second.empty() ? "" : ", ") + second;
}

/// With the name in front; nothing of nothing.
std::string named(std::string_view name, const std::string& text)
{
    return text.empty() ? text : fmt::format("{} {}", name, text);
}

bool isMarkOf(EventKind kind)
{
    return kind == EventKind::Cell || kind == EventKind::RRC || kind == EventKind::Technology;
}

// What is longer than a line is cut: texts come from outside, and there are many.
std::string shortened(std::string_view text)
{
    std::size_t end = std::min(text.size(), longestText);
    while (end > 0 && end < text.size() && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80)
        --end; // not within a character
    return end == text.size() ? std::string(text) : std::string(text.substr(0, end)) + "…";
}

/// A value that becomes another one; the first text says nothing.
class Followed
{
  public:
    void set(std::string_view text) { _now = shortened(text); }
    /// "old → new" where it was something else before; it counts as said.
    std::string takeChange()
    {
        if (_now.empty())
            return {};
        const std::string said = std::exchange(_said, _now);
        return said.empty() || said == _now ? std::string() : fmt::format("{} → {}", said, _now);
    }

  private:
    std::string _said;
    std::string _now;
};

} // namespace

std::string_view nameOf(EventKind kind)
{
    static constexpr std::array<std::string_view, 9> names{
        "Cell", "RRC", "Registration", "Technology", "Call", "Data", "SIM", "Channel", "Alert"};
    return names[static_cast<std::size_t>(kind)];
}

/// Knows what the values say that make events. Changes come one by one; what one message changed
/// makes events together.
class EventLog::Follower : public StoreVisitor
{
  public:
    Follower(const ChangeStore& store, std::vector<ValueAlert> alerts) : _store(store)
    {
        for (ValueAlert& alert : alerts)
            _alerts.emplace_back(std::move(alert));
    }

    std::vector<Event> update();
    void changed(const StoredChange& change) override;

  private:
    /// What a place's value is for: an entry of a table, or none.
    struct Use {
        static constexpr int none = -1;
        int serving = none;
        bool isChannel = false;
        int value = none;
        bool isHolder = false; ///< of groups or lists that make events
    };
    struct Serving {
        std::string identity;
        std::string channel;
        bool isTouched = false;
    };
    struct Cell {
        Followed identity;
        Followed channel;
    };
    struct Value {
        Followed text;
        ListedValues listed;
        bool wasPresent = false;
        bool isPresent = false;
        bool isTouched = false;
    };
    struct Fired {
        std::size_t alert;
        std::string text;
        std::string path;
    };
    /// What the changes of one message have in common.
    struct Message {
        Clock::TimePoint time;
        std::optional<std::uint64_t> record;
        std::uint64_t end; ///< behind its changes
    };

    void useTechnology(std::string_view name);
    void noteChannelEvents();
    void addChannelEvents(std::uint64_t number);
    void addChannelEvent(const ChannelEvent& event);
    void takeStanding();
    void forgetWhatCanGo();
    void begin(const StoredChange& change);
    const Use& useOf(PlaceId place);
    Use findUse(std::string_view path) const;
    void takeShown(const StoredChange& change);
    void takeShown(const Use& use, std::string_view path, std::string_view text);
    void takeValue(std::size_t index, std::string_view path, std::string_view text);
    void takeGone(std::string_view path);
    void takeAlerts(const StoredChange& change);
    void end();
    void addServing();
    void addValues();
    std::string changeOf(const EventPlace& place, Value& value) const;
    void add(EventKind kind, const std::string& text, std::string_view path);

    const ChangeStore& _store;
    std::vector<AlertWatch> _alerts;
    std::uint64_t _next = 0;
    std::size_t _generation = 0;

    std::string _technology;
    std::string _technologyChange; // not told yet
    EventPlaces _known;
    std::vector<Serving> _serving;
    std::vector<Cell> _cells;
    std::vector<Value> _values;
    bool _isFirstMessage = true; // of the technology
    std::vector<std::optional<Use>> _uses;

    std::optional<Message> _message;
    std::vector<Fired> _fired;
    std::deque<ChannelEvent> _channelEvents; // that are not told yet
    std::optional<ChannelEvent> _lastChannelEvent;
    std::vector<Event> _new;
};

std::vector<Event> EventLog::Follower::update()
{
    if (std::exchange(_generation, _store.generation()) != _store.generation()) {
        _uses.clear();
        for (AlertWatch& alert : _alerts)
            alert.forgetPlaces();
    }
    noteChannelEvents();
    if (_next < _store.firstMoment())
        takeStanding();
    _store.visit(_next, *this);
    end();
    _next = _store.present();
    addChannelEvents(_next);
    return std::exchange(_new, {});
}

// ---- Technology and channel

void EventLog::Follower::useTechnology(std::string_view name)
{
    if (name == _technology)
        return;
    _technologyChange = displayNameOf(name);
    if (!_technology.empty())
        _technologyChange = fmt::format("{} → {}", displayNameOf(_technology), _technologyChange);
    _technology = name;
    _known = eventPlacesOf(name);
    _serving.assign(_known.serving.size(), {});
    _cells.assign(_known.serving.size(), {});
    _values.assign(_known.values.size(), {});
    _uses.clear();
    _isFirstMessage = true;
}

// Those that came since. What is forgotten there is not told.
void EventLog::Follower::noteChannelEvents()
{
    const auto isLast = [&](const ChannelEvent& event) {
        return _lastChannelEvent && event.time == _lastChannelEvent->time &&
               event.number == _lastChannelEvent->number && event.kind == _lastChannelEvent->kind;
    };
    const auto& events = _store.channelEvents();
    const auto last = std::find_if(events.rbegin(), events.rend(), isLast);
    _channelEvents.insert(_channelEvents.end(), last.base(), events.end());
    if (!events.empty())
        _lastChannelEvent = events.back();
}

void EventLog::Follower::addChannelEvents(std::uint64_t number)
{
    for (; !_channelEvents.empty() && _channelEvents.front().number <= number;
         _channelEvents.pop_front())
        addChannelEvent(_channelEvents.front());
}

void EventLog::Follower::addChannelEvent(const ChannelEvent& event)
{
    std::string text = "Opened";
    if (event.kind == ChannelEvent::Kind::Lost)
        text = event.text.empty() ? "Lost" : "Lost: " + event.text;
    _new.push_back({event.time, event.number, EventKind::Channel, text, std::string(channelPane),
                    isMarkOf(EventKind::Channel)});
}

// ---- What stood when the following began

// Changes that are gone were not seen: what stands where the others begin counts as said.
void EventLog::Follower::takeStanding()
{
    _next = _store.firstMoment();
    const std::string_view technology = _store.technologyAt(_next);
    if (technology.empty())
        return;
    useTechnology(technology);
    forgetWhatCanGo();
    for (const StoredChange& standing : _store.standing())
        takeShown(standing);
    _message = Message{_store.timeOf(_next), std::nullopt, _next};
    end();
    std::erase_if(_new, [](const Event& event) { return event.kind != EventKind::Technology; });
}

// What went unseen is not there any more.
void EventLog::Follower::forgetWhatCanGo()
{
    for (Value& value : _values) {
        value.isPresent = false;
        value.isTouched = true;
        if (!value.listed.empty())
            value.text.set(textOf({}));
        value.listed.clear();
    }
}

// ---- Changes

void EventLog::Follower::changed(const StoredChange& change)
{
    if (!_message || _message->record != change.record)
        begin(change);
    _message->end = change.number + 1;
    if (change.kind == DisplayChange::Kind::Shown)
        takeShown(change);
    else if (change.kind == DisplayChange::Kind::Gone && useOf(change.place).isHolder)
        takeGone(_store.places().pathOf(change.place));
}

void EventLog::Follower::takeShown(const StoredChange& change)
{
    const Use use = useOf(change.place);
    takeShown(use, use.value == Use::none ? std::string() : _store.places().pathOf(change.place),
              change.value.text);
    takeAlerts(change);
}

void EventLog::Follower::begin(const StoredChange& change)
{
    end();
    addChannelEvents(change.number);
    _message = Message{change.time, change.record, change.number + 1};
    useTechnology(_store.technologyAt(change.number + 1));
}

const EventLog::Follower::Use& EventLog::Follower::useOf(PlaceId place)
{
    if (place >= _uses.size())
        _uses.resize(_store.places().size());
    std::optional<Use>& use = _uses[place];
    if (!use)
        use = findUse(_store.places().pathOf(place));
    return *use;
}

EventLog::Follower::Use EventLog::Follower::findUse(std::string_view path) const
{
    Use use;
    for (std::size_t i = 0; i < _known.serving.size(); ++i) {
        const ServingPlace& place = _known.serving[i];
        if (holderOf(path) != place.path)
            continue;
        const std::string_view name = nameInElement(path);
        if (name != place.identity && name != place.channel)
            continue;
        use.serving = static_cast<int>(i);
        use.isChannel = name == place.channel;
    }
    for (std::size_t i = 0; i < _known.values.size(); ++i) {
        const EventPlace& place = _known.values[i];
        if (isValueOf(path, place))
            use.value = static_cast<int>(i);
        use.isHolder = use.isHolder || isHolderOf(path, place);
    }
    return use;
}

void EventLog::Follower::takeShown(const Use& use, std::string_view path, std::string_view text)
{
    if (isPlaceholder(text))
        return;
    if (use.serving != Use::none) {
        Serving& serving = _serving[static_cast<std::size_t>(use.serving)];
        (use.isChannel ? serving.channel : serving.identity) = text;
        serving.isTouched = true;
    }
    if (use.value != Use::none)
        takeValue(static_cast<std::size_t>(use.value), path, text);
}

void EventLog::Follower::takeValue(std::size_t index, std::string_view path, std::string_view text)
{
    const EventPlace& place = _known.values[index];
    Value& value = _values[index];
    switch (place.shape) {
    case EventShape::Value:
        value.text.set(text);
        break;
    case EventShape::Marked:
        if (!text.starts_with(place.mark))
            return;
        value.text.set(nameInElement(path));
        break;
    case EventShape::Listed:
        value.listed[indexIn(path, place)] = shortened(text);
        value.text.set(textOf(value.listed));
        break;
    case EventShape::Group:
        value.isPresent = true;
        break;
    }
    value.isTouched = true;
}

void EventLog::Follower::takeGone(std::string_view path)
{
    for (std::size_t i = 0; i < _values.size(); ++i) {
        const EventPlace& place = _known.values[i];
        Value& value = _values[i];
        if (!isHolderOf(path, place))
            continue;
        value.isPresent = false;
        value.isTouched = true;
        if (place.shape != EventShape::Listed)
            continue;
        if (isBelow(path, listOf(place.path)))
            value.listed.erase(indexIn(path, place));
        else
            value.listed.clear();
        // A list that was empty from the start has said nothing.
        value.text.set(textOf(value.listed));
    }
}

void EventLog::Follower::takeAlerts(const StoredChange& change)
{
    const PlaceTable& places = _store.places();
    for (std::size_t i = 0; i < _alerts.size(); ++i)
        if (_alerts[i].take(change.place, places, change.value))
            _fired.push_back(
                {i,
                 fmt::format("{} is {} ({})", shortened(places.nameOf(change.place)),
                             shortened(change.value.text), _alerts[i].alert().condition),
                 places.pathOf(places[change.place].holder)});
}

// ---- Events

// What one message has changed at one pane is one event.
void EventLog::Follower::end()
{
    if (!_message)
        return;
    add(EventKind::Technology, std::exchange(_technologyChange, {}), "/");
    addServing();
    addValues();
    for (const Fired& fired : std::exchange(_fired, {})) {
        add(EventKind::Alert, fired.text, fired.path);
        _new.back().alert = fired.alert;
    }
    _isFirstMessage = false;
    _message.reset();
}

void EventLog::Follower::addServing()
{
    for (std::size_t i = 0; i < _serving.size(); ++i) {
        if (!std::exchange(_serving[i].isTouched, false))
            continue;
        const ServingPlace& place = _known.serving[i];
        Cell& cell = _cells[static_cast<std::size_t>(place.cell)];
        cell.identity.set(_serving[i].identity);
        cell.channel.set(_serving[i].channel);
        add(EventKind::Cell,
            joined(named(place.identityName, cell.identity.takeChange()),
                   named(place.channelName, cell.channel.takeChange())),
            place.path);
    }
}

void EventLog::Follower::addValues()
{
    for (std::size_t i = 0; i < _values.size(); ++i) {
        if (!std::exchange(_values[i].isTouched, false))
            continue;
        const EventPlace& place = _known.values[i];
        add(place.kind, changeOf(place, _values[i]), paneOf(place));
    }
}

std::string EventLog::Follower::changeOf(const EventPlace& place, Value& value) const
{
    if (place.shape != EventShape::Group)
        return named(place.name, value.text.takeChange());
    const bool wasPresent = std::exchange(value.wasPresent, value.isPresent);
    if (_isFirstMessage || wasPresent == value.isPresent)
        return {};
    return fmt::format("{} {}", place.name, value.isPresent ? "began" : "ended");
}

void EventLog::Follower::add(EventKind kind, const std::string& text, std::string_view path)
{
    if (text.empty())
        return;
    const bool isOfLast = !_new.empty() && _new.back().moment == _message->end &&
                          _new.back().kind == kind && _new.back().path == path &&
                          kind != EventKind::Alert;
    if (isOfLast)
        _new.back().text = joined(_new.back().text, text);
    else
        _new.push_back(
            {_message->time, _message->end, kind, text, std::string(path), isMarkOf(kind)});
}

// ---- The log

EventLog::EventLog(const ChangeStore& store, std::vector<ValueAlert> alerts)
    : _follower(std::make_unique<Follower>(store, std::move(alerts)))
{
}

EventLog::~EventLog() = default;

std::vector<Event> EventLog::update()
{
    std::vector<Event> made = _follower->update();
    _events.insert(_events.end(), made.begin(), made.end());
    const std::size_t surplus = _events.size() - std::min(_events.size(), mostEvents);
    _events.erase(_events.begin(), _events.begin() + static_cast<std::ptrdiff_t>(surplus));
    return made;
}

} // namespace ventrik
