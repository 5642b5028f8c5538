#pragma once

#include "module/runtime/objects/Ref.h"

#include <array>
#include <cmpidt.h>

namespace KPRV {

/// The object paths that the ends of associations became, for the length of one request. Of thousands of
/// associations most share an end with the one before, and the server keeps each path that is made until the
/// request ends; what is set into an instance or a path is copied.
///
/// How it works. For each role the last end is kept with its path: lists are joined as nested loops, so that
/// the outer end stays the same for many associations, and the inner one changes each time and costs one
/// look. An end is the same if it is the same instance, by its address. The entry holds a count of it: let
/// go, its memory could become another end, whose path would be the former's. A role is known by the address
/// of its name in the metadata. Three roles have room, as many as an association of the catalogue has ends.
/// The handler of a request owns one of these, and no other thread sees it.
class Shared_Ends
{
public:
    /// The path of the role's last end if it is this one; else null. A role is named by its feature's own
    /// text, which is compared as a pointer.
    CMPIObjectPath* find(const char* role, const Instance* end) const
    {
        for (const Known& known : _known) {
            if (known.end.ptr() == end && known.role == role)
                return known.path;
        }
        return nullptr;
    }

    /// Takes note of the path in the place of the role's former one. Roles beyond the third are not noted.
    void note(const char* role, Instance* end, CMPIObjectPath* path)
    {
        for (Known& known : _known) {
            if (known.role && known.role != role)
                continue;
            // Held, so that its place in memory is no other end's.
            ref(end);
            known.end.reset(end);
            known.role = role;
            known.path = path;
            return;
        }
    }

private:
    struct Known
    {
        const char* role = nullptr;
        Ref<Instance> end;
        CMPIObjectPath* path = nullptr;
    };
    std::array<Known, 3> _known;
};

} // namespace KPRV
