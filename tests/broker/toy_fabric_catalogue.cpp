// The classes of the small host as metadata tables, made when they are first asked for.
#include "module/runtime/dispatch/Registration.h"
#include "module/runtime/objects/Meta_Value.h"
#include "tests/broker/toy.h"
#include "tests/broker/toy_fabric.h"

#include <deque>
#include <map>

namespace toy {

std::vector<Named_Text> split(const std::string& text, char between, char inside)
{
    std::vector<Named_Text> parts;
    for (std::size_t from = 0; from < text.size();) {
        std::size_t to = std::min(text.find(between, from), text.size());
        std::size_t middle = text.find(inside, from);
        parts.push_back({text.substr(from, middle - from), text.substr(middle + 1, to - middle - 1)});
        from = to + 1;
    }
    return parts;
}

const Fabric_Class& fabric_class(const std::string& name)
{
    for (const Fabric_Class& candidate : fabric_classes)
        if (candidate.name == name)
            return candidate;
    return fabric_classes.front();
}

} // namespace toy

namespace {

using namespace KPRV;

constexpr uint32 PLAIN = FLAG_PROPERTY | FLAG_READ;

/// Deques, since the records point at each other.
struct Tables
{
    std::deque<Meta_Property> properties;
    std::deque<Meta_Reference> references;
    std::deque<std::vector<const Meta_Feature*>> features;
    std::deque<std::string> names;
    std::map<std::string, Meta_Class> classes;
    std::vector<const Meta_Class*> list;
    std::deque<Registration> registrations;
    Meta_Repository repository;

    Tables()
    {
        for (const toy::Fabric_Class& source : toy::fabric_classes) {
            std::vector<const Meta_Feature*>& own = features.emplace_back();
            if (source.roles)
                add_references(source, own);
            else if (*source.key)
                add_properties(source, own);
            Meta_Class& made = classes[source.name];
            made = {{{0, source.roles ? FLAG_CLASS | FLAG_ASSOCIATION : FLAG_CLASS, source.name, nullptr, 0}},
                    own.data(),
                    static_cast<uint32>(own.size()),
                    0,
                    nullptr,
                    source.superclass ? &classes[source.superclass] : nullptr,
                    1,
                    &repository};
            list.push_back(&made);
            // The name of the real module: the server then looks for the adapter library.
            if (source.served)
                registrations.push_back({"kldrprovider_Module", source.name, nullptr, &made, nullptr});
        }
        for (std::size_t i = 0; i + 1 < registrations.size(); ++i)
            registrations[i].next = &registrations[i + 1];
        repository = {list.data(), static_cast<uint32>(list.size())};
    }

    void add_properties(const toy::Fabric_Class& source, std::vector<const Meta_Feature*>& own)
    {
        for (const toy::Fabric_Property& property : toy::fabric_properties) {
            bool key = std::string(source.key) == property.name;
            uint16 type = property.type == 's' ? STRING : property.type == 'N' ? UINT64 : UINT16;
            sint16 subscript = property.type == 'a' ? -1 : 0;
            uint32 flags = key ? PLAIN | FLAG_KEY : PLAIN;
            own.push_back(&properties.emplace_back(
                Meta_Property{{{0, flags, property.name, nullptr, 0}}, type, subscript, 0, nullptr}));
        }
    }

    void add_references(const toy::Fabric_Class& source, std::vector<const Meta_Feature*>& own)
    {
        for (const toy::Named_Text& role : toy::split(source.roles, ' ', ':')) {
            const char* name = names.emplace_back(role.name).c_str();
            own.push_back(&references.emplace_back(Meta_Reference{
                {{0, FLAG_REFERENCE | FLAG_READ | FLAG_KEY, name, nullptr, 0}}, 0, &classes[role.text], 0}));
        }
    }
};

} // namespace

TOY_EXPORT const Registration* cimple_module()
{
    static const Tables tables;
    return &tables.registrations.front();
}
