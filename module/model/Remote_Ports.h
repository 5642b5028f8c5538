#pragma once

#include "module/adapter/Json_Access.h"
#include "module/runtime/system/log.h"

#include <json/value.h>

#include <algorithm>
#include <string>

namespace KPRV {

/// What is read of an answer about a remote port, as long as the answer stands.
class Remote_Port
{
public:
    explicit Remote_Port(const Json::Value& answer) : _members(answer) {}

    bool is_valid() const { return _members.is_valid(); }
    /// Null if the answer tells of none.
    const Json::Value& device() const { return _members[DEVICE_DATA]; }
    /// A null pointer if there is none.
    const Json::Value* luns() const { return _members.has(LUN_LIST) ? &_members[LUN_LIST] : nullptr; }

private:
    enum : size_t
    {
        DEVICE_DATA,
        ERROR,
        LUN_LIST,
        NUM_MEMBERS
    };
    static constexpr Members<NUM_MEMBERS>::Names NAMES = {"deviceData", "error", "lunList"};

    Answer_Members<NAMES> _members;
};

/// The same of its device.
class Remote_Device
{
public:
    explicit Remote_Device(const Json::Value& device) : _members(device, NAMES) {}

    bool is_target() const { return asBool(_members[IS_TARGET]); }
    /// As CIM numbers it.
    const Json::Value& state() const { return _members[STATE]; }
    const Json::Value& type() const { return _members[TYPE]; }

private:
    enum : size_t
    {
        IS_TARGET,
        STATE,
        TYPE,
        NUM_MEMBERS
    };
    static constexpr Members<NUM_MEMBERS>::Names NAMES = {"isTarget", "stateMofValue", "type"};
    static_assert(std::ranges::is_sorted(NAMES));

    Members<NUM_MEMBERS> _members;
};

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

    /// Asks for the next remote port; past the last one there is no WWN. False if the call threw or there is
    /// no WWN to ask for; an answer may still be a bad one.
    bool ask_next(Call_Site site, Json::Value& answer);
    /// WWN of the remote port asked for last, as the library wrote it.
    const char* wwn() const { return _wwn.c_str(); }

private:
    Json::Value _list;
    Element_Walk _elements{_list};
    Json::Value _request;
    Json::Value* _asked = nullptr; ///< The member of the request that changes, from the first question on.
    std::string _wwn;
};

} // namespace KPRV
