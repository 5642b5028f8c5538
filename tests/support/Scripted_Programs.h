#pragma once

#include "tests/support/Log_Lines.h"
#include "tests/support/Temp_Folder.h"

namespace KPRV {

/// Programs of the test's own, the only ones on the search path for a scope. Each writes its words down
/// before it does what it was told.
class Scripted_Programs
{
public:
    /// The rest of a shell script; shell built-ins only.
    void program(const char* name, const std::string& rest = "exit 0") const
    {
        _folder.write(name,
                      "#!/bin/sh\n{ printf '" + std::string(name) + "'; printf ' [%s]' \"$@\"; echo; } >> " +
                          _folder.path("calls") + "\n" + rest + "\n",
                      true);
    }

    /// "name [word] [word]" of each run, in order.
    Lines runs() const
    {
        Lines result;
        std::istringstream lines(_folder.read("calls"));
        for (std::string line; std::getline(lines, line);)
            result.push_back(line);
        return result;
    }

private:
    Temp_Folder _folder;
    Environment_Override _path{"PATH", _folder.path() + ":/nowhere"};
};

} // namespace KPRV
