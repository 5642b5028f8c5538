#pragma once

#include "module/runtime/system/log.h"

#include <json/value.h>

#include <string>

namespace KPRV {

/// What one local port sees through the fabric, read from the library. Throws nothing; failures are told in
/// the log at ERR, as the caller's lines.
class Remote_Ports
{
public:
    /// Asks for the remote ports of the local port with that WWN, in either form. With a bad answer there are
    /// none.
    Remote_Ports(Call_Site site, const char* port_wwn);

    Remote_Ports(const Remote_Ports&) = delete;
    Remote_Ports& operator=(const Remote_Ports&) = delete;

    /// False if the library did not answer with a list.
    bool listed() const { return _list.isArray(); }
    unsigned size() const { return _list.size(); }

    /// Asks for one remote port, by its place from 0. False if the call threw or there is no WWN to ask for;
    /// an answer may still be a bad one.
    bool ask(Call_Site site, unsigned index, Json::Value& answer);
    /// WWN of the remote port asked for last, as the library wrote it.
    const char* wwn() const { return _wwn.c_str(); }

private:
    Json::Value _list;
    Json::Value _request;
    Json::Value* _asked = nullptr; ///< The member of the request that changes, from the first question on.
    std::string _wwn;
};

} // namespace KPRV
