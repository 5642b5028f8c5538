#pragma once

#include "module/adapter/CIMProviderZntj.h"
#include "module/runtime/system/forced_unwinding.h"
#include "module/runtime/system/log.h"

namespace KPRV {

/// How the log tells of an entry point that threw, at ERR:
///
///     libGetPortByWwn got User exception 7: text        an HbaAgentError, with its code and message
///     libGetPortByWwn got std exception: text           a std::exception
///     libGetPortByWwn got default exception             anything else
///
/// An address that is none, of which the request was to be made, is told without the entry point.
struct Guarded_Entry
{
    /// As the texts write it: the variable's name, one historical misspelling apart.
    const char* name;
    /// If set, starts each text: "<address> - libGetPortByWwn got ...".
    const char* address = nullptr;
    /// If set, the third text is "libGetPortByWwn got default exception for <default_for>", without address
    /// in front.
    const char* default_for = nullptr;
};

/// For a catch handler: logs the exception in flight.
void log_caught(const Guarded_Entry& entry, Call_Site site);

/// Runs what may throw; true if it did not. Pass `LOG_HERE`: the line in the log is the caller's.
template <class Body>
bool guarded(Call_Site site, const Guarded_Entry& entry, Body&& body)
{
    try {
        body();
        return true;
    } catch (...) {
        rethrow_forced_unwinding();
        log_caught(entry, site);
        return false;
    }
}

/// Calls an entry point whose failure must not reach the caller: the answer, or null and not `answered` if it
/// threw. An answer may still be a bad one: see `ProviderUtil::isValidJsonResponse`.
inline Json::Value guarded_answer(Call_Site site, const Guarded_Entry& entry, JsonReqFP call,
                                  const Json::Value& request, bool& answered)
{
    answered = true;
    try {
        return call(request);
    } catch (...) {
        rethrow_forced_unwinding();
        log_caught(entry, site);
        answered = false;
        return Json::Value();
    }
}

/// The same into `response`; false if it threw.
inline bool guarded_call(Call_Site site, const Guarded_Entry& entry, JsonReqFP call,
                         const Json::Value& request, Json::Value& response)
{
    bool answered;
    response = guarded_answer(site, entry, call, request, answered);
    return answered;
}

} // namespace KPRV
