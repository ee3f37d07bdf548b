#pragma once
#pragma GCC system_header

#include <cstdlib>
#include <type_traits>

// What scripts/mutate sets into its copy of the core, so that one build holds many changes. The
// environment says which one is made; a constant expression always has the original.
namespace mutate
{

inline int chosen()
{
    static const char* const text = std::getenv("VENTRIK_MUTATION");
    static const int number = text ? std::atoi(text) : -1;
    return number;
}

constexpr bool made(int change)
{
    return !std::is_constant_evaluated() && chosen() == change;
}

template <typename Value>
constexpr Value number(int change, Value original, Value changed)
{
    return made(change) ? changed : original;
}

/// Stands behind an operator, which follows a second time: `a < Switch<7>() < b` binds as `a < b`.
template <int change>
struct Switch {
};

template <int change, typename Left>
struct Operand {
    const Left& value;
};

} // namespace mutate

#define MUTATE_OPERATOR(original, changed)                                                         \
    namespace mutate                                                                               \
    {                                                                                              \
    template <typename Left, int change>                                                           \
    constexpr Operand<change, Left> operator original(const Left& left, Switch<change>)            \
    {                                                                                              \
        return {left};                                                                             \
    }                                                                                              \
    template <int change, typename Left, typename Right>                                           \
    constexpr auto operator original(const Operand<change, Left>& left, const Right& right)        \
    {                                                                                              \
        using Result = std::decay_t<decltype(left.value original right)>;                          \
        if constexpr (requires { Result(left.value changed right); })                              \
            if (made(change))                                                                      \
                return Result(left.value changed right);                                           \
        return Result(left.value original right);                                                  \
    }                                                                                              \
    }

MUTATE_OPERATOR(<, <=)
MUTATE_OPERATOR(<=, <)
MUTATE_OPERATOR(>, >=)
MUTATE_OPERATOR(>=, >)
MUTATE_OPERATOR(==, !=)
MUTATE_OPERATOR(!=, ==)
MUTATE_OPERATOR(+, -)
MUTATE_OPERATOR(-, +)

#undef MUTATE_OPERATOR
