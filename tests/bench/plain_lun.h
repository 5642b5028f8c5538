#pragma once

#include "tests/bench/plain_walk.h"

namespace KPRV::bench {

/// What the logical units of one target are called. Only the end of an id is written anew for each.
class plain_lun_names
{
public:
    explicit plain_lun_names(const plain_target& target);

    /// Takes the next unit; false if it lacks what a unit must have.
    bool read(const Json::Value& lun);

    /// Of the unit read last: "<target>_<vendor>_<product>_LUN_<number>".
    const char* id() const { return _id; }
    /// The "LUN_<number>" in it.
    const char* element() const { return _element; }

private:
    void add(std::string_view text);

    char _id[128];
    char* const _behind_target;
    char* _end;
    const char* _element;
};

/// `visit(lun, names)` for each logical unit of a target.
template <class Visit>
void plain_for_each_lun(const plain_target& target, Visit visit)
{
    plain_lun_names names(target);
    for (const Json::Value& lun : target.answer["lunList"]) {
        if (names.read(lun))
            visit(lun, names);
    }
}

} // namespace KPRV::bench
