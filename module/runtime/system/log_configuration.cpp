#include "module/runtime/system/log_configuration.h"
#include "module/runtime/system/Regular_File.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace KPRV {

static constexpr char cimple_home_envvar[] = "HOME";
static constexpr char FOLDER[] = ".cimple";
static constexpr char LEVEL_KEY[] = "LOG_LEVEL";
static constexpr size_t MAX_LINE = 1024;

// White space by itself: the locale of the server has no say in it.
static bool is_space(char c)
{
    return c == ' ' || (c >= '\t' && c <= '\r');
}

static const char* skip_space(const char* text)
{
    while (is_space(*text))
        text++;
    return text;
}

static void trim_end(char* line)
{
    size_t n = strlen(line);
    while (n > 0 && is_space(line[n - 1]))
        n--;
    line[n] = '\0';
}

/// The value of a "LOG_LEVEL = value" line; null for every other line.
static const char* level_value(const char* line)
{
    constexpr size_t KEY_SIZE = sizeof(LEVEL_KEY) - 1;
    if (strncmp(line, LEVEL_KEY, KEY_SIZE) != 0)
        return nullptr;
    const char* const separator = skip_space(line + KEY_SIZE);
    return *separator == '=' ? skip_space(separator + 1) : nullptr;
}

/// The first level line decides, also when its value is unknown: later lines are not looked at.
static bool read_level(FILE* file, Log_Level& level)
{
    char line[MAX_LINE];
    while (fgets(line, sizeof(line), file)) {
        if (line[0] == '#')
            continue;
        trim_end(line);
        if (const char* const value = level_value(line))
            return _validate_log_level(value, level) == 0;
    }
    return false;
}

/// False if the path does not fit: a shortened path would name another file.
static bool make_path(char (&path)[LOG_PATH_SIZE], const char* folder, const char* name, const char* suffix)
{
    char* end = path;
    for (const char* const part : {folder, "/", name, suffix}) {
        const size_t size = strlen(part);
        if (size >= size_t(path + sizeof(path) - end))
            return false;
        end = static_cast<char*>(memcpy(end, part, size)) + size;
    }
    *end = '\0';
    return true;
}

bool read_log_configuration(Log_Configuration& configuration)
{
    const char* const home = getenv(cimple_home_envvar);
    char rc_path[LOG_PATH_SIZE];
    if (!home || !make_path(rc_path, home, FOLDER, "rc"))
        return false;

    // Most accounts have none, and each line comes here: to ask whether there is one takes half of a futile
    // open.
    struct stat status;
    if (stat(rc_path, &status) != 0)
        return false;
    const int descriptor = open_regular_file(rc_path, O_RDONLY);
    if (descriptor < 0)
        return false;
    FILE* const file = fdopen(descriptor, "r");
    if (!file) {
        close(descriptor);
        return false;
    }
    const bool found = read_level(file, configuration.level);
    fclose(file);

    return found && make_path(configuration.directory, home, FOLDER, "") &&
           make_path(configuration.messages, configuration.directory, "messages", "") &&
           make_path(configuration.lock, configuration.directory, "messages", ".lock");
}

} // namespace KPRV
