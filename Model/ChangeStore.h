#pragma once

#include "Model/DisplayChanges.h"
#include "Model/MessageObserver.h"
#include "Model/PlaceTable.h"
#include "Packets/RecordCensus.h"
#include "Packets/WantedCodes.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace ventrik
{

class DisplayMoment;

/// What stood at a place. The text lives until the store takes more.
struct StoredValue {
    std::string_view text;
    std::optional<double> number = {};
    std::string_view unit = {};   ///< empty where there is none
    const Field* field = nullptr; ///< what shows there; null where no field of a record does
    std::int64_t raw = 0;
};

/// A change of the display, as the store keeps it.
struct StoredChange {
    std::uint64_t number; ///< so many changes came before
    Clock::TimePoint time;
    std::uint32_t logCode; ///< effective, of the record that told it; 0 where none did
    std::uint64_t record;  ///< the store was told of so many messages before its own
    PlaceId place;
    DisplayChange::Kind kind;
    StoredValue value; ///< of what shows
};

/// Is told what a store holds, in its order.
class StoreVisitor
{
  public:
    virtual ~StoreVisitor() = default;
    virtual void changed(const StoredChange& change) = 0;
    /// A record of that code came again, whether it changed anything or not; once a second at most.
    virtual void heard(Clock::TimePoint /*time*/, std::uint32_t /*logCode*/) {}
};

/// What happened to the log channel.
struct ChannelEvent {
    Clock::TimePoint time;
    std::uint64_t number; ///< so many changes came before
    enum class Kind { Opened, Lost } kind;
    std::string text; ///< of a loss the reason
};

/// Keeps what changed in the display, up to a size and an age, so that it can be shown as it stood
/// at any moment: what is oldest goes. A moment is the number of changes that came before it.
///
/// Changes stand in chunks, each with the state that they begin with, which go as a whole. Times
/// never run back: what is older than what came before it came at the same time.
class ChangeStore : public MessageObserver
{
  public:
    struct Limits {
        std::size_t bytes = std::size_t{64} << 20; ///< about
        std::chrono::nanoseconds age = std::chrono::hours(24);
    };

    explicit ChangeStore(RecordsMode records) : ChangeStore(records, Limits()) {}
    ChangeStore(RecordsMode records, Limits limits);
    ~ChangeStore() override;

    void useGenerator(const LogGenerator* generator, std::string_view technology) override;
    void messageTaken(Clock::TimePoint time, ByteView message,
                      const PlistDictionary& state) override;
    void channelChanged(Clock::TimePoint time, bool isOpen, std::string_view reason);

    RecordsMode records() const { return _records; }
    bool isEmpty() const { return _chunks.empty(); }
    /// The moments from the first one that can be shown to the present.
    std::uint64_t firstMoment() const;
    std::uint64_t present() const { return _present; }
    /// The same as times; the epoch where nothing came.
    Clock::TimePoint firstTime() const;
    Clock::TimePoint lastTime() const { return _lastTime; }
    /// How many messages were older than one before them, by more than a second.
    std::uint64_t lateCount() const { return _lateCount; }
    /// After all that came until then, that time included.
    std::uint64_t momentAt(Clock::TimePoint time) const;
    /// When the last change before a moment came; that of the oldest one where it is gone.
    Clock::TimePoint timeOf(std::uint64_t moment) const;

    DisplayMoment at(std::uint64_t moment) const;
    /// All from that moment on; what came again since then may be told twice.
    void visit(std::uint64_t from, StoreVisitor& visitor) const;
    /// The values that stand at the first moment, with the times when they were told last: what
    /// came before is gone, but they are not. Their texts live until the store takes more.
    std::vector<StoredChange> standing() const;
    /// When a record of that code came last.
    std::optional<Clock::TimePoint> lastHeard(std::uint32_t logCode) const;

    const PlaceTable& places() const { return *_places; }
    /// Another number when all places have new numbers, for the store began anew.
    std::size_t generation() const { return _generation; }
    const std::deque<ChannelEvent>& channelEvents() const { return _channelEvents; }
    /// As on the command line; empty where it was not known.
    std::string_view technologyAt(std::uint64_t moment) const;
    /// The bytes of the message that made a change; empty where they are not kept any more.
    ByteView messageOf(std::uint64_t change) const;

    /// About what it takes.
    std::size_t bytes() const;
    std::size_t changeCount() const;

  private:
    static constexpr std::uint32_t nothing = 0xFFFFFFFF; ///< in the place of a value
    static constexpr std::uint32_t group = 0xFFFFFFFE;

    struct Value {
        std::uint64_t textStart;
        std::uint32_t textSize;
        bool hasNumber;
        double number;
        std::string_view unit; // a constant
        const Field* field;
        std::int64_t raw;
    };
    struct Message {
        Clock::TimePoint time;
        std::uint32_t logCode;
        std::uint32_t firstChange; // of the chunk's
        std::uint64_t bytesStart;
        std::uint64_t record; // so many messages came before
        std::uint32_t bytesSize;
    };
    struct Change {
        std::uint32_t message; // of the chunk's
        PlaceId place;
        std::uint32_t value; // of the chunk's; or nothing, or group
    };
    struct Heard {
        Clock::TimePoint time;
        std::uint32_t logCode;
        std::uint32_t change; // so many of the chunk's came before
    };
    struct NotedLayout {
        std::uint32_t change; // so many of the chunk's came before the one that it belongs to
        ReadLayout layout;
    };
    struct Standing {
        std::uint32_t value = nothing;
        std::uint32_t logCode = 0;
        Clock::TimePoint time = {};
        std::uint64_t change = 0;
    };
    struct KeyState {
        std::uint32_t change;                             // so many of the chunk's came before
        std::vector<std::pair<PlaceId, Standing>> places; // holders before what they hold
    };
    struct Chunk {
        std::uint64_t first = 0; // the number of its first change
        std::vector<Message> messages;
        std::vector<Change> changes;
        std::vector<Value> values;
        std::string texts;
        Bytes packets;
        std::vector<KeyState> keyStates;
        std::vector<Heard> heard;
        std::map<std::uint32_t, Clock::TimePoint> heardBefore;
        std::vector<NotedLayout> layouts;
        std::map<std::uint32_t, ReadLayout> layoutsBefore;
        Clock::TimePoint firstTime = {};
        Clock::TimePoint lastTime = {}; // of a change
        std::size_t keyBytes = 0;
        std::size_t bytesAtStart = 0; // what it took over

        void add(KeyState state);
        std::size_t bytes() const;
        StoredValue valueAt(std::uint32_t value) const;
    };
    struct KnownValue {
        std::uint64_t chunk = ~std::uint64_t{0};
        std::uint32_t value = 0;
    };
    struct KnownPlace {
        std::uint64_t serial = 0;
        PlaceId id = 0;
    };
    struct Technology {
        std::uint64_t number;
        std::string name;
    };

    std::uint32_t codeOf(ByteView message) const;
    bool isFarFromKeyState() const;
    bool hear(std::uint32_t logCode);
    bool noteLayout(bool isOfChanges);
    bool noteOfLastChange(const ReadLayout& layout);
    void takeAll(std::span<const DisplayChange> changes, ByteView message, std::uint32_t logCode,
                 const PlistDictionary& state);
    void takeFirst(std::span<const DisplayChange> changes, ByteView message, std::uint32_t logCode,
                   const PlistDictionary& state);
    void beginMessage(ByteView message, std::uint32_t logCode);
    void take(const DisplayChange& change, const PlistDictionary& state);
    void show(const DisplayPlace& place, const PlistDictionary& state);
    void showHolders(PlaceId id);
    void removeWhatIsNotShown(const PlistDictionary& state);
    void remove(PlaceId id);
    void forget(PlaceId id);
    void addChange(PlaceId id, std::uint32_t value);
    PlaceId idOf(const DisplayPlace& place, const PlistDictionary& state);
    PlaceId holderOf(const DisplayPlace& place, const PlistDictionary& state);
    Standing& standing(PlaceId id);
    std::uint32_t intern(const StoredValue& value);
    void writeKeyState(const PlistDictionary& state);
    void beginChunk();
    void goOnInNewChunk(const PlistDictionary& state);
    bool isFull(const Chunk& chunk) const;
    bool isLong(const Chunk& chunk) const;
    void endChunkIfFull(const PlistDictionary& state);
    void keepSmall(const PlistDictionary& state);
    void keepWithin();
    void beginAnew();
    const Chunk* chunkAt(std::uint64_t moment) const;

    friend class DisplayMoment;

    RecordsMode _records;
    Limits _limits;
    const LogGenerator* _generator = nullptr;
    std::unique_ptr<DisplayChanges> _changes; // of the generator
    WantedCodes _wanted;
    bool _isFirstDisplay = false; // of the generator: nothing was told yet

    std::deque<std::unique_ptr<Chunk>> _chunks;
    std::uint64_t _present = 0;
    std::uint64_t _messagesTold = 0;
    std::uint64_t _lateCount = 0;
    std::uint32_t _message = 0; // of the newest chunk's, whose changes are taken
    Clock::TimePoint _lastTime = {};
    std::shared_ptr<PlaceTable> _places = std::make_shared<PlaceTable>();
    std::size_t _generation = 0;
    std::vector<Standing> _standing;      // by place, in the newest chunk
    std::vector<KnownPlace> _knownPlaces; // by the display's number of them
    std::vector<KnownValue> _knownValues;
    std::map<std::uint32_t, Clock::TimePoint> _lastHeard;
    std::map<std::uint32_t, Clock::TimePoint> _lastNoted;
    std::map<std::uint32_t, ReadLayout> _layouts; // how the last record of each code was read
    std::map<std::uint32_t, std::vector<std::string>> _sections; // that are given a code's records
    std::deque<ChannelEvent> _channelEvents;
    std::deque<Technology> _technologies;
};

} // namespace ventrik
