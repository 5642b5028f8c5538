#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

// Takes elements out of service and puts them back. Exceptions of the library are told in the log and count
// as a bad answer.

/// True if the adapter is enabled; false if it is disabled, and also if nobody can tell. The address comes in
/// either form.
bool getAdapterStatus(const String& address);

/// Enables or disables a port: 0, or -1 for a bad answer. The address comes in index form. Any good answer
/// counts as success, whatever status it holds.
int setPortState(const String& index, bool enable);

/// As `setPortState`, for an adapter, whose address comes in either form.
int setAdapterStatus(const String& address, bool enable);

} // namespace KPRV
