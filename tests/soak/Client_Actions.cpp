#include "tests/soak/Client_Actions.h"

#include "tests/support/Module_Picture.h"

#include <algorithm>
#include <numeric>

namespace KPRV {

namespace {

constexpr const char* ALERTS = "KALDERA_AlertIndication";
constexpr const char* NAME_SPACE = "root/kaldera";

template <class List>
const auto& any_of(const List& list, Random& random)
{
    return std::data(list)[random() % std::size(list)];
}

/// An adapter that vanishes makes for refusals and short lists, never for an exception.
void judge(Soak_World& world, const broker::Result& result)
{
    world.failures += result.exception.has_value();
}

void enumerate(Soak_World& world, Random& random)
{
    judge(world, world.server.enumerate_instances(any_of(world.classes, random)));
}

void enumerate_names(Soak_World& world, Random& random)
{
    judge(world, world.server.enumerate_instance_names(any_of(world.classes, random)));
}

void get(Soak_World& world, Random& random)
{
    judge(world, world.server.get_instance(any_of(world.paths, random)));
}

void walk(Soak_World& world, Random& random)
{
    broker::Request request;
    request.operation = random() % 2 ? broker::Operation::ASSOCIATORS : broker::Operation::REFERENCE_NAMES;
    request.path = any_of(world.paths, random);
    request.filter.association_class = any_of(world.associations, random);
    judge(world, world.server.run(request));
}

void read_records(Soak_World& world, Random& random)
{
    judge(world, world.server.enumerate_instances(any_of(world.memories, random)));
}

void call_agent(Soak_World& world, Random& random)
{
    static const char* const requests[] = {
        R"({"method": "discovery.getGlobalInfo", "id": 1})",
        R"({"method": "discovery.getAllHbasByHost", "params": []})",
        R"({"method": "discovery.getPortByWwn", "params": ["10:00:02:4b:4c:10:00:00"]})",
        R"({"method": "discovery.getDynamicPortStatistics", "params": ["10:00:02:4b:4c:10:00:00"]})",
        R"({"method": "configuration.resetStatisticsForPorts", "params": [["10:00:02:4b:4c:10:00:00", "no port"]]})",
        R"({"method": "discovery.getPortByWwn", "params": []})",
        R"({"method": "no.such.method"})",
        "{\"method\": ",
    };
    const broker::Path_Value service = {
        .name_space = NAME_SPACE,
        .class_name = "KALDERA_AgentService",
        .keys = {{"Name", broker::Plain_Value::text("Kaldera Agent Service Provider")}}};
    judge(world,
          world.server.invoke_method(service, "executeMethod",
                                     {{"request", broker::Plain_Value::text(any_of(requests, random))}}));
}

void run_test(Soak_World& world, Random& random)
{
    if (world.tests.empty() || world.elements.empty())
        return;
    const broker::Result result = world.server.invoke_method(
        any_of(world.tests, random), "RunDiagnostic",
        {{"ManagedElement", broker::Plain_Value::path(any_of(world.elements, random))}});
    judge(world, result);
    world.test_runs += result.ok() && result.return_value.as_uint() == 4096;
}

void set_alarm(Soak_World& world, Random& random)
{
    for (const broker::Path_Value& path : world.paths)
        if (path.class_name == "KALDERA_AlarmDevice") {
            judge(world,
                  world.server.invoke_method(path, "SetAlarmState",
                                             {{"RequestedState", broker::Plain_Value::unsigned_number(
                                                                     CMPI_uint16, 2 + random() % 2)}}));
            return;
        }
}

/// A server switches indications on with the first subscriber and off with the last.
void subscribe(Soak_World& world, Random&)
{
    const std::lock_guard lock(world.subscription);
    if (world.subscribers == 3)
        return;
    world.failures += world.server.activate_filter(ALERTS, NAME_SPACE) != CMPI_RC_OK;
    if (world.subscribers++ == 0)
        world.failures += world.server.enable_indications(ALERTS) != CMPI_RC_OK;
}

void unsubscribe_one(Soak_World& world)
{
    world.failures += world.server.deactivate_filter(ALERTS, NAME_SPACE) != CMPI_RC_OK;
    if (--world.subscribers == 0)
        world.failures += world.server.disable_indications(ALERTS) != CMPI_RC_OK;
}

void unsubscribe(Soak_World& world, Random&)
{
    const std::lock_guard lock(world.subscription);
    if (world.subscribers)
        unsubscribe_one(world);
}

void raise_event(Soak_World& world, Random& random)
{
    const std::string id = std::to_string(1 + random() % 16);
    world.simulator.event(R"({"eventCategory": 2, "eventId": )" + id +
                          R"(, "eventSeverity": 2, "portIndexString": "10:00:02:4b:4c:10:00:00",)"
                          R"( "eventMsg": "soak"})");
}

/// Between a list and its details an adapter may go; the next call finds it again.
void let_adapter_vanish(Soak_World& world, Random& random)
{
    const char* const calls[] = {"getHbaByWwn", "getPortByWwn", "getFcPhyPortIndicesByAdapter"};
    world.simulator.add_fault(
        std::string(R"({"call": ")") + any_of(calls, random) +
        R"(", "address": "10:00:02:4b:4c:10:00:00", "do": "error", "at": 1, "times": 2})");
}

void mend(Soak_World& world, Random&)
{
    world.simulator.clear_faults();
}

// clang-format off
constexpr Client_Action actions[] = {
    {"enumerate",       400, enumerate},
    {"enumerate names", 100, enumerate_names},
    {"get",             150, get},
    {"walk",             98, walk},
    {"records",           2, read_records},
    {"agent",           150, call_agent},
    {"test",              5, run_test},
    {"alarm",            20, set_alarm},
    {"subscribe",         5, subscribe},
    {"unsubscribe",       5, unsubscribe},
    {"event",             5, raise_event},
    {"vanish",           30, let_adapter_vanish},
    {"mend",             30, mend},
};
// clang-format on

constexpr unsigned WEIGHTS =
    std::accumulate(std::begin(actions), std::end(actions), 0u,
                    [](unsigned sum, const Client_Action& action) { return sum + action.weight; });
static_assert(WEIGHTS == 1000);

void add_paths(Soak_World& world, std::vector<broker::Path_Value>& paths, const char* class_name)
{
    for (const broker::Instance_Value& instance : world.server.enumerate_instances(class_name).instances)
        paths.push_back(instance.path);
}

} // namespace

std::span<const Client_Action> client_actions()
{
    return actions;
}

const Client_Action& choose_action(Random& random)
{
    unsigned left = static_cast<unsigned>(random() % WEIGHTS);
    for (const Client_Action& action : actions) {
        if (left < action.weight)
            return action;
        left -= action.weight;
    }
    return actions[0];
}

bool remembers_tests(const std::string& class_name)
{
    return class_name.find("Record") != std::string::npos || class_name.find("Job") != std::string::npos;
}

void look_around(Soak_World& world)
{
    for (const std::string& name : enumerable_classes(world.server)) {
        (remembers_tests(name) ? world.memories : world.classes).push_back(name);
        if (!remembers_tests(name) && world.server.catalogue().find(name)->is_association)
            world.associations.push_back(name);
    }
    for (const char* name : {"KALDERA_ComputerSystem", "KALDERA_PortController", "KALDERA_FCPort",
                             "KALDERA_EthernetPort", "KALDERA_AlarmDevice", "KALDERA_StorageExtent",
                             "KALDERA_AdapterSoftwareIdentity", "KALDERA_RegisteredProfile"})
        add_paths(world, world.paths, name);
    for (const char* name : {"KALDERA_PortController", "KALDERA_FCPort", "KALDERA_EthernetPort"})
        add_paths(world, world.elements, name);
    for (const char* name : {"KALDERA_MemoryDiagnosticTest", "KALDERA_PCILoopbackDiagnosticTest",
                             "KALDERA_EthLoopbackDiagnosticTest"})
        add_paths(world, world.tests, name);
}

void end_subscriptions(Soak_World& world)
{
    const std::lock_guard lock(world.subscription);
    while (world.subscribers)
        unsubscribe_one(world);
}

} // namespace KPRV
