#include "kldrcim/walks/Health.h"

#include "broker/values/Path_Identity.h"
#include "broker/values/Type_Words.h"
#include "kldrcim/walks/Agent.h"
#include "kldrcim/walks/Host_Facts.h"
#include "kldrcim/walks/Property_Values.h"
#include "kldrcim/walks/Rpc_Text.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <map>

namespace KPRV::kldrcim {

namespace {

constexpr const char* counters_class = "KALDERA_FCPortStatistics";
constexpr std::uint64_t CONVERGED = 1;
constexpr std::uint64_t COMPLETION_FAILED = 5;

/// Counters at an earlier look, by the statistics' identifier.
using First_Look = std::unordered_map<std::string, Instance_Value>;

/// By how much a counter has grown; one that has been reset meanwhile counts from 0.
std::uint64_t growth(std::uint64_t before, std::uint64_t now)
{
    return now >= before ? now - before : now;
}

class Check
{
public:
    Check(Connection& connection, const Health_Options& options)
        : _connection(connection), _options(options), _index(connection)
    {
    }

    Health_Report run()
    {
        look_first();
        _facts = read_host_facts(_index, {});
        look_at_host();
        for (const Adapter_Facts& adapter : _facts.adapters)
            look_at_adapter(adapter);
        compare_paths();
        compare_firmware();
        look_at_tests();
        for (const Provider_Failure& failure : _index.failures())
            note("no-answer", Node_Kind::SYSTEM, {{.class_name = failure.provider_class}},
                 std::string(status_name(failure.rc)) +
                     (failure.message.empty() ? "" : ": " + failure.message));
        finish();
        return std::move(_report);
    }

private:
    void note(const char* name, Node_Kind element_kind, const Instance_Value& element,
              std::string detail = {})
    {
        note(find_finding(name), element_kind, element, std::move(detail));
    }
    void note(const Finding_Kind* kind, Node_Kind element_kind, const Instance_Value& element,
              std::string detail = {})
    {
        if (!is_ignored(*kind, element))
            _report.findings.push_back({kind, element_kind, element, std::move(detail)});
    }

    bool is_ignored(const Finding_Kind& kind, const Instance_Value& element) const
    {
        return std::ranges::any_of(_options.ignored, [&](const std::string& word) {
            const std::string id = lower_name(text_of(element, "DeviceID")),
                              name = lower_name(text_of(element, "Name"));
            return word == kind.name || word == id || word == name || name.ends_with("_" + word);
        });
    }

    void look_first()
    {
        if (!_options.pause)
            return;
        _report.errors_grown = 0;
        for (Instance_Value& each : _connection.enumerate_instances(counters_class).instances) {
            const std::string id = text_of(each, "InstanceID");
            _first_look.emplace(id, std::move(each));
        }
        _options.pause();
    }

    /// The library's own answer tells a host without adapters from one whose library nobody has found.
    bool has_adapter_library()
    {
        std::string error;
        const Result answer = call_agent(_connection, *rpc_request("discovery.getHost", {}, error));
        return !answer.ok() || read_rpc_reply(agent_reply(answer)).result != "null";
    }

    void look_at_host()
    {
        if (_facts.adapters.empty() && _index.failures().empty())
            note(has_adapter_library() ? "no-adapter" : "adapter-library-missing", Node_Kind::SYSTEM,
                 _facts.system);
    }

    void look_at_status(Node_Kind kind, const Instance_Value& element)
    {
        const auto status = number_of(element, "OperationalStatus");
        if (!status)
            return;
        if (const Finding_Kind* finding = finding_of_status(kind, *status))
            note(finding, kind, element);
        else if (kind == Node_Kind::FC_PORT || kind == Node_Kind::ETHERNET_PORT)
            ++_report.ports_in_service;
    }

    void look_at_adapter(const Adapter_Facts& adapter)
    {
        ++_report.adapters;
        look_at_status(Node_Kind::ADAPTER, adapter.controller);
        look_at_drivers(adapter);
        for (const Port_Facts& port : adapter.ports) {
            ++_report.ports;
            look_at_status(port.is_ethernet ? Node_Kind::ETHERNET_PORT : Node_Kind::FC_PORT, port.port);
            look_at_speed(port.port);
            look_at_counters(port);
            for (const Target_Facts& target : port.targets)
                look_at_status(Node_Kind::TARGET, target.endpoint);
        }
    }

    /// An adapter without any driver has no name; a converged one needs two.
    void look_at_drivers(const Adapter_Facts& adapter)
    {
        const auto has = [&](const char* what) {
            return std::ranges::any_of(adapter.software, [&](const Instance_Value& each) {
                return number_of(each, "Classifications") == CLASSIFICATION_DRIVER &&
                       text_of(each, "ElementName") == what;
            });
        };
        const bool has_ethernet = std::ranges::any_of(adapter.ports, &Port_Facts::is_ethernet);
        if (text_of(adapter.controller, "Name").empty())
            note("driver-missing", Node_Kind::ADAPTER, adapter.controller);
        else if (number_of(adapter.controller, "ControllerType") != CONVERGED && !has("Storage driver"))
            note("driver-missing", Node_Kind::ADAPTER, adapter.controller, "storage driver");
        else if (has_ethernet && !has("Network driver"))
            note("driver-missing", Node_Kind::ADAPTER, adapter.controller, "network driver");
    }

    void look_at_speed(const Instance_Value& port)
    {
        const auto speed = number_of(port, "Speed"), most = number_of(port, "MaxSpeed");
        if (speed && most && *speed != 0 && *speed < *most)
            note("link-slow", Node_Kind::FC_PORT, port);
    }

    void look_at_counters(const Port_Facts& port)
    {
        const auto first = _first_look.find(text_of(port.statistics, "InstanceID"));
        if (first == _first_look.end())
            return;
        std::string detail;
        for (const char* counter : error_counters()) {
            const std::uint64_t grown = growth(number_of(first->second, counter).value_or(0),
                                               number_of(port.statistics, counter).value_or(0));
            *_report.errors_grown += grown;
            if (grown)
                detail += (detail.empty() ? "" : ", ") + std::string(counter) + " +" + std::to_string(grown);
        }
        if (!detail.empty())
            note("port-errors-growing", Node_Kind::FC_PORT, port.port, detail);
    }

    void compare_paths()
    {
        std::map<std::string, std::vector<const Target_Facts*>> seen;
        for (const Adapter_Facts& adapter : _facts.adapters)
            for (const Port_Facts& port : adapter.ports)
                for (const Target_Facts& target : port.targets)
                    seen[target.address].push_back(&target);
        _report.targets = seen.size();
        for (const Adapter_Facts& adapter : _facts.adapters)
            for (const Port_Facts& port : adapter.ports)
                for (const Target_Facts& target : port.targets)
                    if (seen[target.address].size() == 1)
                        note("single-path-target", Node_Kind::TARGET, target.endpoint);
    }

    void compare_firmware()
    {
        std::map<std::string, std::string> newest;
        for (const Adapter_Facts& adapter : _facts.adapters)
            if (std::string& best = newest[adapter.model()];
                strverscmp(best.c_str(), adapter.firmware().c_str()) < 0)
                best = adapter.firmware();
        for (const Adapter_Facts& adapter : _facts.adapters) {
            const std::string model = adapter.model(), own = adapter.firmware();
            if (!model.empty() && !own.empty() && own != newest[model])
                note("firmware-differs", Node_Kind::ADAPTER, adapter.controller,
                     own + ", and " + newest[model] + " is in another " + model);
        }
    }

    /// Of each test the last run on each element counts. A record's identifier is "TEST-RUN:RECORD".
    void look_at_tests()
    {
        struct Run
        {
            unsigned long number = 0;
            Path_Value element;
            const Instance_Value* failed = nullptr;
        };
        std::map<std::pair<std::string, std::string>, Run> last;
        for (const Instance_Value& record : _index.instances("KALDERA_DiagnosticCompletionRecord")) {
            const auto ends = _index.far_ends("KALDERA_CompletionRecordAppliesToElement", "Antecedent",
                                              record.path, "Dependent");
            const std::string id = text_of(record, "InstanceID");
            const std::size_t dash = id.rfind('-');
            if (ends.empty() || dash == id.npos)
                continue;
            const unsigned long number = std::strtoul(id.c_str() + dash + 1, nullptr, 10);
            Run& run = last[{path_identity(ends[0]), text_of(record, "ServiceName")}];
            if (number > run.number)
                run = {number, ends[0], nullptr};
            if (number == run.number && number_of(record, "CompletionState") == COMPLETION_FAILED)
                run.failed = &record;
        }
        for (const auto& [place, run] : last)
            if (run.failed)
                note("diagnostic-failed", kind_of(run.element), _index.instance(run.element),
                     place.second + ": " + text_of(*run.failed, "RecordData"));
    }

    static Node_Kind kind_of(const Path_Value& element)
    {
        return same_name(element.class_name, "KALDERA_FCPort")         ? Node_Kind::FC_PORT
               : same_name(element.class_name, "KALDERA_EthernetPort") ? Node_Kind::ETHERNET_PORT
                                                                       : Node_Kind::ADAPTER;
    }

    void finish()
    {
        std::ranges::stable_sort(_report.findings, {}, &Health_Finding::kind);
        for (const Health_Finding& finding : _report.findings)
            _report.rank = worse(_report.rank, finding.kind->rank);
    }

    Connection& _connection;
    const Health_Options& _options;
    Association_Index _index;
    First_Look _first_look;
    Host_Facts _facts;
    Health_Report _report;
};

} // namespace

Health_Report check_health(Connection& connection, const Health_Options& options)
{
    return Check(connection, options).run();
}

} // namespace KPRV::kldrcim
