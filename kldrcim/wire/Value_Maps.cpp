#include "kldrcim/wire/Value_Maps.h"

#include "broker/values/Value.h"

namespace KPRV::kldrcim {

namespace {

Value_Map counted_from_one(std::vector<std::string> words)
{
    Value_Map map;
    for (std::size_t i = 1; i <= words.size(); ++i)
        map.numbers.push_back(std::to_string(i));
    map.words = std::move(words);
    return map;
}

} // namespace

const Value_Map* find_value_map(std::string_view class_name, std::string_view property)
{
    // Clients look a profile's organization up by its word.
    static const Value_Map organizations = counted_from_one({"Other",
                                                             "DMTF",
                                                             "CompTIA",
                                                             "Consortium for Service Innovation",
                                                             "FAST",
                                                             "GGF",
                                                             "INTAP",
                                                             "itSMF",
                                                             "NAC",
                                                             "Northwest Energy Efficiency Alliance",
                                                             "SNIA",
                                                             "TM Forum",
                                                             "The Open Group",
                                                             "ANSI",
                                                             "IEEE",
                                                             "IETF",
                                                             "INCITS",
                                                             "ISO",
                                                             "W3C",
                                                             "OGF"});
    return broker::same_name(class_name, "CIM_RegisteredSpecification") &&
                   broker::same_name(property, "RegisteredOrganization")
               ? &organizations
               : nullptr;
}

} // namespace KPRV::kldrcim
