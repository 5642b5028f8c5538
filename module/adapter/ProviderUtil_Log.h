#pragma once

#include "module/runtime/system/log.h"

// The toolbox is spread over several files, but to the reader of a log it is one unit: its lines carry one
// name.
#define UTIL_HERE (::KPRV::Call_Site{"ProviderUtil.cpp", __LINE__})
#define UTIL_LOG(level, ...) LOG_LINE(level, "ProviderUtil.cpp", __LINE__, __VA_ARGS__)
#define UTIL_SCOPE(function) ::KPRV::Log_Scope _log_scope(function, UTIL_HERE)
