#pragma once

#include "module/runtime/ground/Types.h"

#include <atomic>
#include <cstdarg>

namespace KPRV {

/// A larger number means more talk: a line is written when its level is at or below the configured one.
enum class Log_Level : int
{
    FATAL = 0,
    ERR = 1,
    WARN = 2,
    INFO = 3,
    DBG = 4,
};

extern const char* const _log_level_strings[5];

/// Writes one line to the log of the user's account, `.cimple/messages` in the home directory, if `.cimplerc`
/// there asks for it. Never fails, never throws, is no point where a thread is cancelled, and never calls
/// into the CIM server: a line for which there is no memory is cut. `file` is a base name.
void log(Log_Level level, const char* file, size_t line, const char* format, ...) noexcept
    __attribute__((format(printf, 4, 5)));
void vlog(Log_Level level, const char* file, size_t line, const char* format, va_list arguments) noexcept
    __attribute__((format(printf, 4, 0)));

/// Switches the runtime's own conversion lines on or off; direct calls of `log` are not touched. -1 if it was
/// so already.
int log_enable(bool flag);
/// Read by call sites before they build a `Log_Call_Frame`.
extern std::atomic<bool> _log_enabled_state;

/// What is above is dropped: the configured level while the log is open, otherwise the highest, since each
/// line is then an attempt to open it.
extern std::atomic<Log_Level> _log_threshold;
/// False if a line of that level would be dropped: then neither it nor its arguments need be made.
inline bool log_uses(Log_Level level)
{
    return level <= _log_threshold.load(std::memory_order_relaxed);
}
/// Sets the level in memory only: the configuration file overrides it. -1 for an unknown name.
int log_set_level(const char* name);
int _validate_log_level(const char* name, Log_Level& level);
/// Closes the log; the next line configures it anew.
void close_log();

/// A captured call site.
struct Log_Call_Frame
{
    Log_Level level;
    const char* file;
    uint32 line;
    void invoke(const char* format, ...) const noexcept __attribute__((format(printf, 2, 3)));
};

/// Where a shared function was called from, so that its log lines carry the caller's file and line: pass
/// `LOG_HERE`.
struct Call_Site
{
    const char* file;
    uint32 line;
};

/// LOG_LINE(ERR, file, line, "format", ...): one line at the level, as one of that place. The arguments are
/// made only if the line is used.
#define LOG_LINE(level, file, line, ...)                                                                     \
    do {                                                                                                     \
        if (::KPRV::log_uses(::KPRV::Log_Level::level))                                                      \
            ::KPRV::log(::KPRV::Log_Level::level, file, line, __VA_ARGS__);                                  \
    } while (0)

/// Trace of a function: "Entering: %s" now, "Returning: %s" at the end of the scope, both at DBG.
class Log_Scope
{
public:
    explicit Log_Scope(const char* function, Call_Site site) : _function(function), _site(site)
    {
        LOG_LINE(DBG, _site.file, _site.line, "Entering: %s", _function);
    }
    ~Log_Scope() { LOG_LINE(DBG, _site.file, _site.line, "Returning: %s", _function); }
    Log_Scope(const Log_Scope&) = delete;
    Log_Scope& operator=(const Log_Scope&) = delete;

private:
    const char* _function;
    Call_Site _site;
};

} // namespace KPRV

/// LOG(ERR, "format", ...): the same with the base name of this file and its line.
#define LOG(level, ...) LOG_LINE(level, __FILE_NAME__, __LINE__, __VA_ARGS__)

#define LOG_HERE (::KPRV::Call_Site{__FILE_NAME__, __LINE__})

#define LOG_SCOPE(function) ::KPRV::Log_Scope _log_scope(function, LOG_HERE)

/// The runtime's own conversion lines, which `log_enable(false)` silences.
#define LOG_CONVERSION(level, ...)                                                                           \
    do {                                                                                                     \
        if (::KPRV::_log_enabled_state)                                                                      \
            ::KPRV::Log_Call_Frame{::KPRV::Log_Level::level, __FILE_NAME__, __LINE__}.invoke(__VA_ARGS__);   \
    } while (0)
