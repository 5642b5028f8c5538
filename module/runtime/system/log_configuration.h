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

} // namespace KPRV
