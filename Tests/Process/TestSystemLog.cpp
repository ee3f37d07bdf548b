// In the place of the C library's system log: VENTRIK_TEST_SYSTEM_LOG is "stuck", for one whose
// daemon takes no lines, or a file that the lines go to.
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <string_view>

#include <syslog.h>
#include <unistd.h>

namespace
{

std::string_view behavior()
{
    const char* value = std::getenv("VENTRIK_TEST_SYSTEM_LOG");
    return value ? value : "";
}

bool isStuck = false;

[[noreturn]] void waitForEver()
{
    isStuck = true;
    for (;;)
        pause();
}

void write(int priority, const char* format, va_list arguments)
{
    if (behavior() == "stuck")
        waitForEver();
    std::FILE* file = std::fopen(behavior().data(), "ae");
    if (!file)
        return;
    std::fprintf(file, "%d ", priority);
    std::vfprintf(file, format, arguments);
    std::fputc('\n', file);
    std::fclose(file);
}

} // namespace

extern "C" void syslog(int priority, const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    write(priority, format, arguments);
    va_end(arguments);
}

extern "C" void __syslog_chk(int priority, int, const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    write(priority, format, arguments);
    va_end(arguments);
}

// It shares a lock with a writer that waits.
extern "C" void closelog()
{
    if (isStuck)
        waitForEver();
}
