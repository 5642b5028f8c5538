#include "module/runtime/system/log.h"
#include "module/runtime/system/File_Lock.h"
#include "module/runtime/system/Regular_File.h"
#include "module/runtime/system/Standard_Mutex.h"
#include "module/runtime/system/Time.h"
#include "module/runtime/system/log_configuration.h"
#include "module/runtime/text/Buffer.h"

#include <algorithm>
#include <cstdio>
#include <ctime>
#include <fcntl.h>
#include <new>
#include <pthread.h>
#include <strings.h>
#include <sys/stat.h>
#include <unistd.h>

// How it works. A line is written if the user's file asks for its level. Until the log is open each call
// looks for that file, since it may be put in place while the server runs; from then on the threshold, an
// atomic, drops what is too talkative before any lock is taken. What is to be written takes the mutex among
// the threads, then the lock file among the processes that share the log, and appends the whole line before
// either is let go.
//
// It must not fail whoever calls it: destructors log, and so does code that has just run out of memory. So
// nothing throws out of it; a line for which there is no memory is put together on the stack and cut; a
// thread that is cancelled is not unwound while it holds the mutex. Nothing inside calls the server, which
// may be what the line is about.

namespace KPRV {

const char* const _log_level_strings[5] = {"FATAL", "ERR", "WARN", "INFO", "DBG"};

constinit std::atomic<bool> _log_enabled_state = true;

/// A plain one: nothing inside calls back into the logger.
static constinit Standard_Mutex<> _mutex;
static bool _initialized GUARDED_BY(_mutex);
static Log_Level _level GUARDED_BY(_mutex);
constinit std::atomic<Log_Level> _log_threshold = Log_Level::DBG;
static FILE* _log_file_handle GUARDED_BY(_mutex);
static File_Lock* _lock GUARDED_BY(_mutex);

namespace {

/// Nobody cancels a thread that holds it: the unwinding would meet destructors that log.
class SCOPED_CAPABILITY Auto_Log_Mutex
{
public:
    Auto_Log_Mutex() ACQUIRE(_mutex)
    {
        pthread_setcancelstate(PTHREAD_CANCEL_DISABLE, &_cancel_state);
        _mutex.lock();
    }
    ~Auto_Log_Mutex() RELEASE()
    {
        _mutex.unlock();
        pthread_setcancelstate(_cancel_state, nullptr);
    }
    Auto_Log_Mutex(const Auto_Log_Mutex&) = delete;
    Auto_Log_Mutex& operator=(const Auto_Log_Mutex&) = delete;

private:
    int _cancel_state;
};

} // namespace

static FILE* open_messages(const char* path)
{
    const int descriptor = open_regular_file(path, O_WRONLY | O_CREAT | O_APPEND, 0666);
    if (descriptor < 0)
        return nullptr;
    FILE* const file = fdopen(descriptor, "a");
    if (!file)
        close(descriptor);
    return file;
}

/// Tried anew by every call until it succeeds: a user may put the rc file in place while the server runs.
static void configure() REQUIRES(_mutex)
{
    Log_Configuration configuration;
    if (!read_log_configuration(configuration))
        return;
    _level = configuration.level;

    mkdir(configuration.directory, 0777);
    _lock = new File_Lock(configuration.lock);
    if (_lock->okay())
        _log_file_handle = open_messages(configuration.messages);
    if (_log_file_handle) {
        _initialized = true;
        _log_threshold = _level;
    } else {
        delete _lock;
        _lock = nullptr;
    }
}

static void write(const char* text, size_t size) REQUIRES(_mutex)
{
    // A lock that cannot be had does not keep the line out of the log.
    _lock->lock();
    fwrite(text, 1, size, _log_file_handle);
    fflush(_log_file_handle);
    _lock->unlock();
}

/// The time of the line, its level and its place.
static void write_head(char (&head)[256], Log_Level level, const char* file, size_t line)
{
    const time_t now = time_t(Time::now() / Time::SEC);
    tm local = {};
    localtime_r(&now, &local);
    snprintf(head, sizeof head, "%04d/%02d/%02d %02d:%02d:%02d %s: %s(%d): ", local.tm_year + 1900,
             local.tm_mon + 1, local.tm_mday, local.tm_hour, local.tm_min, local.tm_sec,
             _log_level_strings[int(level)], file, int(line));
}

/// What fits of a line for which there is no memory.
static void write_cut_line(const char* head, const char* format, va_list arguments) REQUIRES(_mutex)
{
    char text[512];
    constexpr size_t ROOM = sizeof text - 1;
    size_t size = size_t(snprintf(text, ROOM, "%s", head));
    const int wanted = vsnprintf(text + size, ROOM - size, format, arguments);
    size = std::min(size + size_t(std::max(wanted, 0)), ROOM - 1);
    if (text[size - 1] != '\n')
        text[size++] = '\n';
    write(text, size);
}

static void write_line(Log_Level level, const char* file, size_t line, const char* format, va_list arguments)
    REQUIRES(_mutex)
{
    char head[256];
    write_head(head, level, file, line);
    va_list again;
    va_copy(again, arguments);
    try {
        Buffer text;
        text.append(head);
        text.vformat(format, arguments);
        if (text.data()[text.size() - 1] != '\n')
            text.append('\n');
        write(text.data(), text.size());
    } catch (const std::bad_alloc&) {
        write_cut_line(head, format, again);
    }
    va_end(again);
}

void vlog(Log_Level level, const char* file, size_t line, const char* format, va_list arguments) noexcept
{
    if (!log_uses(level))
        return;
    const Auto_Log_Mutex guard;
    try {
        if (!_initialized)
            configure();
    } catch (const std::bad_alloc&) {
        return;
    }
    if (_log_file_handle && level <= _level)
        write_line(level, file, line, format, arguments);
}

void log(Log_Level level, const char* file, size_t line, const char* format, ...) noexcept
{
    if (!log_uses(level))
        return;
    va_list arguments;
    va_start(arguments, format);
    vlog(level, file, line, format, arguments);
    va_end(arguments);
}

void Log_Call_Frame::invoke(const char* format, ...) const noexcept
{
    va_list arguments;
    va_start(arguments, format);
    vlog(level, file, line, format, arguments);
    va_end(arguments);
}

int log_enable(bool flag)
{
    return _log_enabled_state.exchange(flag) == flag ? -1 : 0;
}

int _validate_log_level(const char* name, Log_Level& level)
{
    for (int i = 0; i < 5; i++) {
        if (strcasecmp(name, _log_level_strings[i]) == 0) {
            level = Log_Level(i);
            return 0;
        }
    }
    return -1;
}

int log_set_level(const char* name)
{
    Log_Level level;
    if (_validate_log_level(name, level) != 0)
        return -1;
    const Auto_Log_Mutex guard;
    _level = level;
    if (_initialized)
        _log_threshold = level;
    return 0;
}

void close_log()
{
    const Auto_Log_Mutex guard;
    if (!_initialized)
        return;
    delete _lock;
    _lock = nullptr;
    fclose(_log_file_handle);
    _log_file_handle = nullptr;
    _initialized = false;
    _log_threshold = Log_Level::DBG;
}

/// A server may load and unload the module many times in one process: the log must not keep a descriptor of
/// each time. The priority makes this the last of the destructors, since the others may still log.
[[gnu::destructor(101)]] static void close_log_at_unload()
{
    close_log();
}

} // namespace KPRV
