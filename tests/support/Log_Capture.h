#pragma once

#include "runtime/log.h"
#include "tests/support/Temp_Folder.h"

#include <sstream>
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
    struct Line
    {
        std::string level;
        std::string file;
        std::string text;
    };

    explicit Log_Capture(const char* level = "DBG") : _home_override("HOME", _home.path())
    {
        _home.write(".cimplerc", std::string("LOG_LEVEL=") + level + "\n");
        close_log();
    }
    ~Log_Capture() { close_log(); }

    /// All lines so far, taken apart.
    std::vector<Line> lines() const
    {
        std::vector<Line> result;
        std::istringstream file(_home.read(".cimple/messages"));
        for (std::string raw; std::getline(file, raw);) {
            // "2026/01/31 12:00:00 ERR: Source.cpp(12): text"
            std::istringstream words(raw);
            std::string date, time, level, source;
            words >> date >> time >> level >> source;
            if (!level.ends_with(':') || !source.ends_with("):"))
                result.back().text += "\n" + raw;
            else {
                std::string text;
                std::getline(words, text);
                result.push_back(
                    {level.substr(0, level.size() - 1), source.substr(0, source.find('(')), text.substr(1)});
            }
        }
        return result;
    }

    /// The lines but for the traces of entering and returning, each as "LEVEL text".
    std::vector<std::string> said() const
    {
        std::vector<std::string> result;
        for (const Line& line : lines()) {
            if (!line.text.starts_with("Entering: ") && !line.text.starts_with("Returning: "))
                result.push_back(line.level + " " + line.text);
        }
        return result;
    }
    /// As `said`, the traces alone.
    std::vector<std::string> traces() const
    {
        std::vector<std::string> result;
        for (const Line& line : lines()) {
            if (line.text.starts_with("Entering: ") || line.text.starts_with("Returning: "))
                result.push_back(line.level + " " + line.text);
        }
        return result;
    }
    /// Those of `said` that begin with the words, usually a level.
    std::vector<std::string> said(const char* words) const
    {
        std::vector<std::string> result = said();
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

using Lines = std::vector<std::string>;

} // namespace KPRV
