#pragma once

#include <algorithm>
#include <sstream>
#include <string>
#include <vector>

namespace KPRV {

using Lines = std::vector<std::string>;

/// A line of the log, taken apart.
struct Log_Line
{
    std::string level;
    std::string file;
    std::string text;

    bool is_trace() const { return text.starts_with("Entering: ") || text.starts_with("Returning: "); }
};

/// Reads the text of a log: lines of the form "2026/01/31 12:00:00 ERR: Source.cpp(12): text". What has no
/// such head belongs to the line before it.
inline std::vector<Log_Line> parse_log(const std::string& content)
{
    std::vector<Log_Line> result;
    std::istringstream file(content);
    for (std::string raw; std::getline(file, raw);) {
        // The heads of millions of lines are read in the tests, under sanitizers too: without a stream for
        // each.
        std::size_t end = 0;
        const auto word = [&] {
            const std::size_t begin = std::min(raw.find_first_not_of(' ', end), raw.size());
            end = std::min(raw.find(' ', begin), raw.size());
            return raw.substr(begin, end - begin);
        };
        const std::string date = word(), time = word(), level = word(), source = word();
        if (!level.ends_with(':') || !source.ends_with("):")) {
            if (!result.empty())
                result.back().text += "\n" + raw;
            continue;
        }
        result.push_back({level.substr(0, level.size() - 1), source.substr(0, source.find('(')),
                          raw.substr(std::min(end + 1, raw.size()))});
    }
    return result;
}

/// "LEVEL text" of the lines that the choice accepts.
template <class Choice>
Lines told(const std::vector<Log_Line>& lines, Choice choice)
{
    Lines result;
    for (const Log_Line& line : lines) {
        if (choice(line))
            result.push_back(line.level + " " + line.text);
    }
    return result;
}

} // namespace KPRV
