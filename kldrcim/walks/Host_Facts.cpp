#include "kldrcim/walks/Host_Facts.h"

#include "kldrcim/walks/Property_Values.h"
#include "kldrcim/walks/Topology_Plan.h"

namespace KPRV::kldrcim {

namespace {

constexpr std::uint64_t INITIATOR_ROLE = 2;

/// Targets by the name of the initiator that sees them: a far endpoint is named for both sides of the path,
/// "INITIATOR_TARGET".
using Targets = std::unordered_map<std::string, std::vector<Target_Facts>>;

/// Units by the names of both sides, which their identifier begins with: "INITIATOR_TARGET_...".
using Unit_Counts = std::unordered_map<std::string, std::size_t>;

class Facts_Walk
{
public:
    Facts_Walk(Association_Index& index, const Host_Facts_Options& options) : _index(index), _options(options)
    {
    }

    Host_Facts run()
    {
        Host_Facts host;
        const std::vector<Instance_Value>& systems = _index.instances(topology_root_class);
        if (systems.empty())
            return host;
        host.system = systems.front();
        if (_options.units)
            for (const char* class_name : {"KALDERA_StorageExtent", "KALDERA_TapeDrive"})
                count_units(class_name);
        collect_targets();
        for (const Path_Value& end :
             far("KALDERA_PortControllerSystemDevice", "GroupComponent", host.system, "PartComponent"))
            host.adapters.push_back(adapter(end));
        return host;
    }

private:
    std::vector<Path_Value> far(const char* association, const char* near_role, const Instance_Value& near,
                                const char* far_role)
    {
        return _index.far_ends(association, near_role, near.path, far_role);
    }

    void count_units(const char* class_name)
    {
        for (const Path_Value& unit : _index.names(class_name)) {
            const Plain_Value* const id = unit.key("DeviceID");
            const std::string text = id ? id->as_text() : "";
            const std::size_t first = text.find('_');
            const std::size_t second = first == text.npos ? first : text.find('_', first + 1);
            if (second != text.npos)
                ++_unit_counts[text.substr(0, second)];
        }
    }

    void collect_targets()
    {
        for (const Instance_Value& endpoint : _index.instances("KALDERA_SCSIProtocolEndpoint")) {
            const std::string name = text_of(endpoint, "Name");
            const std::size_t between = name.find('_');
            if (number_of(endpoint, "Role") == INITIATOR_ROLE || between == name.npos)
                continue;
            const auto units = _unit_counts.find(name);
            _targets[name.substr(0, between)].push_back(
                {endpoint, name.substr(between + 1), units == _unit_counts.end() ? 0 : units->second});
        }
    }

    Adapter_Facts adapter(const Path_Value& path)
    {
        Adapter_Facts facts = {_index.instance(path)};
        const Instance_Value& controller = facts.controller;
        for (const Path_Value& card : far("KALDERA_Realizes", "Dependent", controller, "Antecedent"))
            facts.card = _index.instance(card);
        for (const Path_Value& end :
             far("KALDERA_AdapterElementSoftwareIdentity", "Dependent", controller, "Antecedent"))
            facts.software.push_back(_index.instance(end));
        for (const Path_Value& end : far("KALDERA_ControlledBy", "Antecedent", controller, "Dependent"))
            facts.ports.push_back(fc_port(end));
        for (const Path_Value& end :
             far("KALDERA_EthernetPortControlledBy", "Antecedent", controller, "Dependent"))
            facts.ports.push_back({_index.instance(end), true});
        return facts;
    }

    Port_Facts fc_port(const Path_Value& path)
    {
        Port_Facts facts = {_index.instance(path)};
        if (_options.statistics)
            for (const Path_Value& end :
                 far("KALDERA_ElementStatisticalData", "ManagedElement", facts.port, "Stats"))
                facts.statistics = _index.instance(end);
        for (const Path_Value& end :
             far("KALDERA_DeviceSAPImplementation", "Antecedent", facts.port, "Dependent"))
            if (auto seen = _targets.find(text_of(_index.instance(end), "Name")); seen != _targets.end())
                facts.targets = seen->second;
        return facts;
    }

    Association_Index& _index;
    const Host_Facts_Options& _options;
    Unit_Counts _unit_counts;
    Targets _targets;
};

} // namespace

std::string Adapter_Facts::model() const
{
    return text_of(card, "Model");
}

std::string Adapter_Facts::firmware() const
{
    for (const Instance_Value& each : software)
        if (number_of(each, "Classifications") == CLASSIFICATION_FIRMWARE)
            return text_of(each, "VersionString");
    return "";
}

Host_Facts read_host_facts(Association_Index& index, const Host_Facts_Options& options)
{
    return Facts_Walk(index, options).run();
}

} // namespace KPRV::kldrcim
