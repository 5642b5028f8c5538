#pragma once

#include "module/runtime/system/log.h"
#include "tests/support/Log_Lines.h"
#include "tests/support/Temp_Folder.h"

#include <string>
#include <vector>

namespace KPRV {

/// Sends the log of a scope to a home directory of its own, at DBG, and reads it back.
///
///     Log_Capture log;
///     ...
///     EXPECT_EQ(log.text(), "ERR got nothing\n");
class Log_Capture
{
public:
    using Line = Log_Line;

    explicit Log_Capture(const char* level = "DBG") : _home_override("HOME", _home.path())
    {
        _home.write(".cimplerc", std::string("LOG_LEVEL=") + level + "\n");
        close_log();
    }
    ~Log_Capture() { close_log(); }

    /// All lines so far, taken apart.
    std::vector<Log_Line> lines() const { return parse_log(_home.read(".cimple/messages")); }

    /// The lines but for the traces of entering and returning, each as "LEVEL text".
    Lines said() const
    {
        return told(lines(), [](const Log_Line& line) { return !line.is_trace(); });
    }
    /// As `said`, the traces alone.
    Lines traces() const
    {
        return told(lines(), [](const Log_Line& line) { return line.is_trace(); });
    }
    /// Those of `said` that begin with the words, usually a level.
    Lines said(const char* words) const
    {
        Lines result = said();
        std::erase_if(result, [&](const std::string& line) { return !line.starts_with(words); });
        return result;
    }
    bool has(const std::string& line) const
    {
        for (const std::string& each : said()) {
            if (each == line)
                return true;
        }
        return false;
    }
    void clear() const
    {
        close_log();
        std::error_code ignored;
        std::filesystem::remove(_home.path(".cimple/messages"), ignored);
    }

private:
    Temp_Folder _home;
    Environment_Override _home_override;
};

} // namespace KPRV
