#pragma once

#include "Model/ChangeStore.h"
#include "Model/DisplayTree.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace ventrik
{

/// The display as it stood at a moment. It holds what it tells, whatever becomes of the store.
class DisplayMoment : public DisplayTree
{
  public:
    /// A value as it stood then.
    struct Value {
        StoredValue shown;
        Clock::TimePoint changed; ///< since when it shows that
        Clock::TimePoint written; ///< when it was told last, to about a second
        std::uint32_t logCode;    ///< effective, of the record that told it; 0 where none did
        std::uint64_t change;     ///< the number of the change
    };

    /// A moment of the store, the nearest that it still has, when its last change came; the present
    /// with all that came since.
    DisplayMoment(const ChangeStore& store, std::uint64_t moment);
    /// The same later on, before the next change.
    DisplayMoment(const ChangeStore& store, std::uint64_t moment, Clock::TimePoint time);
    ~DisplayMoment() override;
    DisplayMoment(DisplayMoment&&) noexcept;
    DisplayMoment& operator=(DisplayMoment&&) noexcept;

    std::uint64_t moment() const;
    Clock::TimePoint time() const;
    /// As on the command line; empty where it was not known.
    const std::string& technology() const;

    ModelNodePointer topLevelNodes() override;
    ModelNodePointer nodeAtPath(const std::string& path) override;
    std::string_view doubtAt(const std::string& path) const override;
    std::vector<std::string> layoutWarningsAt(const std::string& path) const override;
    /// Null where no value stands.
    const Value* valueAt(const std::string& path) const;

    /// The keys and row numbers on the way there, from the outside in; empty where nothing stands.
    /// They last as long as this does.
    std::vector<std::string_view> keysAt(const std::string& path) const;

  private:
    void build() const;

    struct Content;
    std::unique_ptr<Content> _content;
};

} // namespace ventrik
