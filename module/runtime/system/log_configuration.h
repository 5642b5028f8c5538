#pragma once

#include "module/runtime/system/log.h"

namespace KPRV {

inline constexpr size_t LOG_PATH_SIZE = 1024;

/// What the rc file of the user's account asks for, and where that account keeps its log.
struct Log_Configuration
{
    Log_Level level;
    char directory[LOG_PATH_SIZE];
    char messages[LOG_PATH_SIZE];
    char lock[LOG_PATH_SIZE];
};

/// Reads `.cimplerc` in the directory that HOME names. False when there is nothing to log by: no HOME, no
/// file, no usable LOG_LEVEL line.
bool read_log_configuration(Log_Configuration& configuration);

/// Whether that file is missing, as it is for most accounts: every line asks, and a walk over a host has
/// many.
class Rc_File_Absence
{
public:
    /// True if there is no such file. Looks at once when HOME has changed; otherwise not before somebody can
    /// have put one in place.
    bool holds();

private:
    /// When there was none, by a clock that does not jump; 0: never looked.
    long long _seen = 0;
    char _home[LOG_PATH_SIZE] = {};
};

} // namespace KPRV
