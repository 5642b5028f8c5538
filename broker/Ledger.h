#pragma once

#include "broker/Object_Kind.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <cstddef>
#include <cstdio>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace KPRV::broker {

/// Counts what was handed to the provider: objects by kind and by the call that made them, and what became of
/// them. The host's own arguments of a call are not counted. Safe for any thread.
class Ledger
{
public:
    struct Entry
    {
        Object_Kind kind = Object_Kind::STRING;
        std::string maker;
        std::size_t made = 0;
        /// Given back by `CMRelease`.
        std::size_t released = 0;
        /// Left to the server: freed when the call returned or the thread detached.
        std::size_t freed_by_frame = 0;

        std::size_t live() const { return made - released - freed_by_frame; }
    };

    /// Names of calls are kept as they come, as constants.
    void made(Object_Kind kind, const char* maker);
    void released(Object_Kind kind, const char* maker);
    void freed_by_frame(Object_Kind kind, const char* maker);

    /// Objects that exist now, clones included. After all calls have returned and all threads have detached,
    /// each is lost.
    std::size_t live() const;
    std::size_t live(Object_Kind kind) const;

    /// All rows, by kind and then by maker.
    std::vector<Entry> entries() const;

    /// Two lists, both by kind and making call: what calls left to the server, and what is lost for good.
    void report(std::FILE* out) const;

    void clear();

private:
    Entry& at(Object_Kind kind, const char* maker) REQUIRES(_mutex);

    mutable Standard_Mutex<> _mutex;
    std::map<std::pair<Object_Kind, std::string_view>, Entry> _entries GUARDED_BY(_mutex);
    /// The entries of names that have come before: the same constant comes again and again.
    struct Known
    {
        Object_Kind kind;
        const char* maker;
        Entry* entry;
    };
    std::vector<Known> _known GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
