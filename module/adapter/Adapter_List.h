#pragma once

#include "module/adapter/Json_Access.h"
#include "module/runtime/ground/String.h"
#include "module/runtime/system/log.h"

#include <json/value.h>

namespace KPRV {

/// An answer that lists addresses, read in one pass; as long as the answer stands.
class Address_List
{
public:
    explicit Address_List(const Json::Value& answer) : _members(answer) {}

    bool is_valid() const { return _members.is_valid(); }
    /// `indexStrings`, of whatever type; a null pointer if there is none.
    const Json::Value* list() const { return _members.has(LIST) ? &_members[LIST] : nullptr; }

private:
    enum : size_t
    {
        ERROR,
        LIST,
        NUM_MEMBERS
    };
    static constexpr Members<NUM_MEMBERS>::Names NAMES = {"error", "indexStrings"};

    Answer_Members<NAMES> _members;
};

/// Asks the library for the addresses of all adapters. `response` keeps the answer; the result is its array
/// (or null value) `indexStrings`, a null pointer for a bad answer, which is told at ERR. The library's
/// exceptions pass.
const Json::Value* query_adapter_list(Call_Site site, Json::Value& response);

/// Address of an adapter by its place in that list, from 0; empty, told at ERR, if it is no text.
String adapter_address(Call_Site site, const Json::Value& list, unsigned index);

} // namespace KPRV
