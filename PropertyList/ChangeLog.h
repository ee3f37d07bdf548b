#pragma once

#include <algorithm>
#include <cstddef>
#include <memory>
#include <utility>
#include <vector>

namespace ventrik
{

/// The containers that have changed since it was last taken, by the tokens that whoever watches
/// them gave them. Following what changes then costs nothing for what does not.
class ChangeLog
{
  public:
    void note(std::size_t token) { _tokens.push_back(token); }
    /// In the order of their first change.
    std::vector<std::size_t> take() { return std::exchange(_tokens, {}); }
    /// The same, with the room that there is already.
    void takeInto(std::vector<std::size_t>& tokens)
    {
        tokens.clear();
        tokens.swap(_tokens);
    }
    bool empty() const { return _tokens.empty(); }

  private:
    std::vector<std::size_t> _tokens;
};

/// A container's part of being watched. It may stand at several places that are watched, each with
/// a token of its own, but for one log only: a later one takes the place of the one before.
class ContainerWatch
{
  public:
    ContainerWatch() = default;
    // Nobody watches a copy.
    ContainerWatch(const ContainerWatch&) noexcept {}
    ContainerWatch& operator=(const ContainerWatch&) = delete;
    ~ContainerWatch() = default;

    /// The next change is noted, under this token as well.
    void add(const std::shared_ptr<ChangeLog>& log, std::size_t token)
    {
        if (!_watching || _watching->log != log)
            _watching = std::make_unique<Watching>(Watching{log, {}, {}, false, false});
        if (std::ranges::find(_watching->tokens, token) == _watching->tokens.end())
            _watching->tokens.push_back(token);
        _watching->entries.clear();
        _watching->haveAllChanged = false;
        _watching->hasNoted = false;
    }
    void remove(const std::shared_ptr<ChangeLog>& log, std::size_t token)
    {
        if (_watching && _watching->log == log)
            std::erase(_watching->tokens, token);
    }

    /// The places of the values that changed, some of them more than once, until it is added anew;
    /// null where more than values changed. Of what stands at several places that is not known.
    const std::vector<std::size_t>* changedValues() const
    {
        const bool areKnown =
            _watching && !_watching->haveAllChanged && _watching->tokens.size() == 1;
        return areKnown ? &_watching->entries : nullptr;
    }

    /// The container changes.
    void note()
    {
        if (!_watching)
            return;
        _watching->haveAllChanged = true;
        noteOnce();
    }
    /// Only the value at that place does.
    void note(std::size_t entry)
    {
        if (!_watching)
            return;
        noteOnce();
        if (_watching->entries.size() < maximumEntries)
            _watching->entries.push_back(entry);
        else
            _watching->haveAllChanged = true;
    }

  private:
    static constexpr std::size_t maximumEntries = 256;

    struct Watching {
        std::shared_ptr<ChangeLog> log;
        std::vector<std::size_t> tokens;
        std::vector<std::size_t> entries; // that changed
        bool haveAllChanged;
        bool hasNoted;
    };

    void noteOnce()
    {
        if (std::exchange(_watching->hasNoted, true))
            return;
        for (const std::size_t token : _watching->tokens)
            _watching->log->note(token);
    }

    std::unique_ptr<Watching> _watching; // null for most
};

} // namespace ventrik
