#pragma once

#include <string_view>

namespace ventrik
{

/// What a program does before anything else: a standard descriptor that is closed is opened on
/// /dev/null, so that no file or socket of ours gets its number, in the direction in which its use
/// still fails. A reader that has gone shows as an error of the write from then on, not as SIGPIPE,
/// and one that takes nothing does not hold up the end: what printing left in the buffer of
/// standard output is dropped then.
void prepareStandardStreams();

/// How long to wait for whoever reads what we write.
enum class Patience {
    Brief,  ///< until nothing has been taken for 1 s
    Endless ///< as long as it takes
};

/// Writes all of the text. False, with errno (EAGAIN when the patience is over) and what is left of
/// the text, when the place does not take it; never throws, and holds no lock that another thread
/// could want.
bool writeText(int descriptor, std::string_view& text, Patience patience);
inline bool writeText(int descriptor, std::string_view&& text, Patience patience)
{
    return writeText(descriptor, text, patience);
}

/// "PROGRAM: REASON" as one line on standard error, with nothing in it that a terminal would obey.
/// Where standard error does not take it, it is lost and the program goes on.
void complain(std::string_view program, std::string_view reason,
              Patience patience = Patience::Brief);

/// For programs whose standard output is their result alone: gives a descriptor of it, and has what
/// others write there go to standard error, or nowhere. -1 where standard output is closed.
enum class OthersOutput { ToStandardError, Nowhere };
int takeStandardOutput(OthersOutput others);

/// The exit status of a program that cannot write what it was started for, with the errno of that:
/// 1, and the reason on standard error; or 141 in silence when whoever read it has gone.
int tellOutputFailure(std::string_view program, std::string_view what, int error);

} // namespace ventrik
