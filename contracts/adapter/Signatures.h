#pragma once

#include <cstdint>
#include <json/forwards.h>

namespace KPRV {

// How the entry points of the adapter library are called: the signature classes of Entry_Points.def. Any
// thread may call any of them; what one answers belongs to the caller, but for a text, which the library
// keeps.

/// Called by the library for each of its events, on any of its threads: the event as JSON text.
using evtProcessCB = void (*)(const char* event);
/// Called by the library for each of its log lines, on any thread: level (1 to 5), file, line, text.
using log4cxxMsgCB = void (*)(int level, const char* file, int line, const char* text);

using JsonReqFP = Json::Value (*)(const Json::Value& request);
using JsonReqVoidFP = void (*)(const Json::Value& request);
using voidRetStrFP = const char* (*)();
using voidRetUIntFP = std::uint32_t (*)();
using voidRetIntFP = std::int32_t (*)();
using evtProcessCBRetVoidFP = void (*)(evtProcessCB callback);
using log4cxxMsgRetVoidFP = void (*)(log4cxxMsgCB callback);

} // namespace KPRV
