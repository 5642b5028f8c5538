#include "broker/Ledger.h"

namespace KPRV::broker {

Ledger::Entry& Ledger::at(Object_Kind kind, const char* maker)
{
    for (const Known& known : _known)
        if (known.maker == maker && known.kind == kind)
            return *known.entry;
    Entry& entry = _entries[{kind, maker}];
    if (entry.maker.empty()) {
        entry.kind = kind;
        entry.maker = maker;
    }
    _known.push_back({kind, maker, &entry});
    return entry;
}

void Ledger::made(Object_Kind kind, const char* maker)
{
    const Auto_Lock lock(_mutex);
    ++at(kind, maker).made;
}

void Ledger::released(Object_Kind kind, const char* maker)
{
    const Auto_Lock lock(_mutex);
    ++at(kind, maker).released;
}

void Ledger::freed_by_frame(Object_Kind kind, const char* maker)
{
    const Auto_Lock lock(_mutex);
    ++at(kind, maker).freed_by_frame;
}

std::size_t Ledger::live() const
{
    std::size_t count = 0;
    for (const Entry& entry : entries())
        count += entry.live();
    return count;
}

std::size_t Ledger::live(Object_Kind kind) const
{
    std::size_t count = 0;
    for (const Entry& entry : entries())
        count += entry.kind == kind ? entry.live() : 0;
    return count;
}

std::vector<Ledger::Entry> Ledger::entries() const
{
    const Auto_Lock lock(_mutex);
    std::vector<Entry> list;
    for (const auto& [key, entry] : _entries)
        list.push_back(entry);
    return list;
}

void Ledger::report(std::FILE* out) const
{
    auto list = [&](const char* title, auto count) {
        std::size_t total = 0;
        for (const Entry& entry : entries())
            total += count(entry);
        std::fprintf(out, "%s: %zu\n", title, total);
        for (const Entry& entry : entries())
            if (std::size_t number = count(entry))
                std::fprintf(out, "  %8zu  %-12s from %s\n", number, kind_name(entry.kind),
                             entry.maker.c_str());
    };
    list("Objects left to the server", [](const Entry& entry) { return entry.freed_by_frame; });
    list("Objects lost", [](const Entry& entry) { return entry.live(); });
}

void Ledger::clear()
{
    const Auto_Lock lock(_mutex);
    _known.clear();
    _entries.clear();
}

} // namespace KPRV::broker
