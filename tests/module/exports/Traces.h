#pragma once

#include "tests/support/Log_Lines.h"

#include <algorithm>

namespace KPRV {

/// What a log says to be entered (>) and left (<), as "> file name", each where it comes first. How often it
/// comes is a matter of the host.
inline Lines traces_of(const std::vector<Log_Line>& log)
{
    const std::string entering = "Entering: ", returning = "Returning: ";
    Lines seen;
    for (const Log_Line& line : log) {
        if (!line.is_trace())
            continue;
        const bool enters = line.text.starts_with(entering);
        const std::string name = line.text.substr((enters ? entering : returning).size());
        const std::string trace = (enters ? "> " : "< ") + line.file + " " + name;
        if (std::ranges::find(seen, trace) == seen.end())
            seen.push_back(trace);
    }
    return seen;
}

inline std::string as_text(const Lines& traces)
{
    std::string text;
    for (const std::string& trace : traces)
        text += "  " + trace + "\n";
    return text;
}

/// Of what runs on several threads, whose order nobody knows.
inline std::string as_sorted_text(Lines traces)
{
    std::ranges::sort(traces);
    return as_text(traces);
}

} // namespace KPRV
