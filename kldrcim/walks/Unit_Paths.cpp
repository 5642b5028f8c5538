#include "kldrcim/walks/Unit_Paths.h"

#include "broker/values/Path_Identity.h"
#include "kldrcim/walks/Health_Plan.h"
#include "kldrcim/walks/Property_Values.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

constexpr const char* path_class = "KALDERA_SCSIInitiatorTargetLogicalUnitPath";
constexpr const char* no_identifier = "Unable To Fetch";

/// "2" of "LUN_2".
std::string lun_of(const Instance_Value& unit)
{
    const std::string name = text_of(unit, "ElementName");
    return name.starts_with("LUN_") ? name.substr(4) : name;
}

class Path_Walk
{
public:
    explicit Path_Walk(Association_Index& index) : _index(index) {}

    std::vector<Logical_Unit> run()
    {
        for (const Path_Value& link : _index.names(path_class)) {
            const Path_Value* const initiator = end_of(link, "Initiator");
            const Path_Value* const target = end_of(link, "Target");
            const Path_Value* const unit = end_of(link, "LogicalUnit");
            if (initiator && target && unit)
                add(*initiator, *target, _index.instance(*unit));
        }
        return std::move(_units);
    }

private:
    static const Path_Value* end_of(const Path_Value& link, const char* role)
    {
        const Plain_Value* const value = link.key(role);
        return value ? value->as_path() : nullptr;
    }

    struct End
    {
        std::string address;
        std::string adapter;
        Instance_Value troubled;
    };

    void add(const Path_Value& initiator, const Path_Value& target, Instance_Value unit)
    {
        const End& near = end(initiator);
        const End& far = end(target);
        Unit_Path path = {near.address, far.address, lun_of(unit), near.adapter,
                          near.troubled.properties.empty() ? far.troubled : near.troubled};
        const std::string identifier = unit_identifier(unit);
        const auto [at, is_new] =
            _known.try_emplace(identifier.empty() ? path_identity(unit.path) : identifier, _units.size());
        if (is_new)
            _units.push_back({std::move(unit), identifier, {}});
        _units[at->second].paths.push_back(std::move(path));
    }

    /// What there is to know of an endpoint. The far one is named for both sides: near address, "_", far
    /// address.
    const End& end(const Path_Value& path)
    {
        const auto [at, is_new] = _ends.try_emplace(path_identity(path));
        if (!is_new)
            return at->second;
        const Instance_Value endpoint = _index.instance(path);
        const std::string name = text_of(endpoint, "Name");
        at->second.address = name.substr(name.find('_') + 1);
        if (const auto status = number_of(endpoint, "OperationalStatus"); status && !is_in_service(*status))
            at->second.troubled = endpoint;
        for (const Path_Value& port :
             _index.far_ends("KALDERA_DeviceSAPImplementation", "Dependent", path, "Antecedent"))
            for (const Path_Value& adapter :
                 _index.far_ends("KALDERA_ControlledBy", "Dependent", port, "Antecedent"))
                at->second.adapter = path_identity(adapter);
        return at->second;
    }

    Association_Index& _index;
    std::vector<Logical_Unit> _units;
    /// Places of the units by their identifiers.
    std::unordered_map<std::string, std::size_t> _known;
    std::unordered_map<std::string, End> _ends;
};

} // namespace

Redundancy Logical_Unit::redundancy() const
{
    const auto working = std::ranges::count_if(paths, &Unit_Path::in_service);
    if (working < 2)
        return working == 1 ? Redundancy::ONE_PATH : Redundancy::NO_PATH;
    const auto first = std::ranges::find_if(paths, &Unit_Path::in_service);
    const bool is_one = std::ranges::all_of(
        paths, [&](const Unit_Path& path) { return !path.in_service() || path.adapter == first->adapter; });
    return is_one ? Redundancy::ONE_ADAPTER : Redundancy::FULL;
}

std::vector<Logical_Unit> read_units(Association_Index& index)
{
    return Path_Walk(index).run();
}

bool is_unit_identifier(const std::string& name)
{
    return !name.empty() && name != no_identifier;
}

std::string unit_identifier(const Instance_Value& unit)
{
    const std::string name = text_of(unit, "Name");
    return is_unit_identifier(name) ? name : "";
}

} // namespace KPRV::kldrcim
