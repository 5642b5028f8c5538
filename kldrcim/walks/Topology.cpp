// The walk: associations first, by the plan, as numbers; then the instances behind them, of which only a text
// is kept.
#include "kldrcim/walks/Topology.h"

#include "kldrcim/input/Address_Words.h"
#include "kldrcim/walks/Object_Numbers.h"
#include "kldrcim/walks/Unit_Paths.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

using Number = Topology::Number;
using Link = Topology::Link;

auto place(const Link& link)
{
    return std::pair(link.from, link.above);
}

/// How far below the host; an initiator is its port in another role.
unsigned depth_of(Node_Kind kind)
{
    switch (kind) {
    case Node_Kind::SYSTEM:
        return 0;
    case Node_Kind::ADAPTER:
        return 1;
    case Node_Kind::CONNECTOR:
    case Node_Kind::TARGET:
        return 3;
    case Node_Kind::UNIT:
    case Node_Kind::UNITS:
        return 4;
    default:
        return 2;
    }
}

/// Hands paths or instances on as they come, and tells how many.
template <class Each>
class Each_Of final : public Receiver
{
public:
    Each_Of(const Topology_Options& options, const std::string& class_name, Each each)
        : _options(options), _class_name(class_name), _each(std::move(each))
    {
        tell();
    }

    bool instance(Instance_Value&& instance) override { return take(instance.path, &instance); }
    bool path(Path_Value&& path) override { return take(path, nullptr); }

private:
    bool take(const Path_Value& path, const Instance_Value* instance)
    {
        _each(path, instance);
        if (++_count % 256 == 0)
            tell();
        return true;
    }
    void tell() const
    {
        if (_options.progress)
            _options.progress(_class_name, _count);
    }

    const Topology_Options& _options;
    const std::string& _class_name;
    Each _each;
    std::size_t _count = 0;
};

/// Numbers of the objects that a role of an association holds: neighbours often share them.
class Role_Numbers
{
public:
    Role_Numbers(Object_Numbers& numbers, const char* role) : _numbers(numbers), _role(role) {}

    /// Null if the link has no such end.
    const Path_Value* end_of(const Path_Value& link) const
    {
        const Plain_Value* const value = _role ? link.key(_role) : nullptr;
        return value ? value->as_path() : nullptr;
    }
    Number of(const Path_Value& end)
    {
        if (_last == Object_Numbers::none || !(end == _path)) {
            _last = _numbers.of(end);
            _path = end;
        }
        return _last;
    }

private:
    Object_Numbers& _numbers;
    const char* _role;
    Path_Value _path;
    Number _last = Object_Numbers::none;
};

class Walk
{
public:
    Walk(Connection& connection, const Topology_Options& options) : _connection(connection), _options(options)
    {
    }

    Topology run()
    {
        ask(topology_root_class, Operation::ENUMERATE_INSTANCES,
            [&](const Path_Value& path, const Instance_Value* system) {
                const Number number = _numbers.of(path);
                meet(number, Node_Kind::SYSTEM);
                say(number, *system);
                _topology.roots.push_back(number);
            });
        for (const Topology_Step* step = topology_steps; step->association; ++step)
            if (takes(*step))
                follow(*step);
        prune_adapters();
        read_instances();
        if (_options.merge_units)
            merge_units();
        return std::move(_topology);
    }

private:
    bool takes(const Topology_Step& step) const
    {
        if (_options.depth != 0 && depth_of(step.to) > _options.depth)
            return false;
        switch (step.taken) {
        case Topology_Step::WITH_SOFTWARE:
            return _options.software;
        case Topology_Step::WITH_CONNECTORS:
            return _options.connectors;
        case Topology_Step::CROSS_LINK:
            return _options.cross_links;
        default:
            return true;
        }
    }

    template <class Each>
    void ask(const std::string& class_name, Operation operation, Each each)
    {
        Each_Of<Each> receiver(_options, class_name, std::move(each));
        Request request;
        request.operation = operation;
        request.path.class_name = class_name;
        if (operation == Operation::ENUMERATE_INSTANCES)
            request.properties = _options.properties;
        const Result result = _connection.run(request, &receiver);
        if (!result.ok())
            _topology.failures.push_back({class_name, result.rc, result.message});
    }

    bool is_node(Number number, Node_Kind kind) const
    {
        return number < _topology.nodes.size() && _topology.nodes[number].is_met &&
               _topology.nodes[number].kind == kind;
    }

    void meet(Number number, Node_Kind kind)
    {
        if (number >= _topology.nodes.size())
            _topology.nodes.resize(std::max<std::size_t>(number + 1, _numbers.size()));
        Topology::Node& node = _topology.nodes[number];
        if (!node.is_met)
            node = {kind, true, {}};
    }

    void say(Number number, const Instance_Value& instance)
    {
        Topology::Node& node = _topology.nodes[number];
        node.text = _topology.texts.keep(_options.text_of(node.kind, instance));
    }

    /// False for an adapter or port that is not the one that was named.
    bool is_wanted(Node_Kind kind, const Path_Value& path) const
    {
        const bool is_port = kind == Node_Kind::FC_PORT || kind == Node_Kind::ETHERNET_PORT;
        const std::string& wanted = kind == Node_Kind::ADAPTER ? _options.adapter
                                    : is_port                  ? _options.port
                                                               : "";
        const Plain_Value* const id = path.key("DeviceID");
        return wanted.empty() || (id && address_digits(id->as_text()) == address_digits(wanted));
    }

    /// The links of the step from what was met. An association that two steps follow was kept by the first.
    void follow(const Topology_Step& step)
    {
        if (!has_node(_topology, {step.from}))
            return;
        Topology::Step_Links found = {&step, {}};
        if (step.above_role)
            found.links = std::move(_kept);
        else
            read_links(step, found.links);
        // Each far end once for each start, where it first came.
        if (step.taken == Topology_Step::CROSS_LINK)
            std::erase_if(found.links, [&](const Link& link) { return !is_node(link.to, step.to); });
        if (step.to == Node_Kind::UNIT && _options.count_units)
            found.links = counted(found.links);
        else
            for (const Link& link : found.links)
                meet(link.to, step.to);
        _topology.steps.push_back(std::move(found));
    }

    void read_links(const Topology_Step& step, std::vector<Link>& links)
    {
        // A path names initiator, target and unit at once: the unit is kept for the step behind.
        const Topology_Step* const behind = &step + 1;
        const bool is_shared = behind->above_role && takes(*behind);
        Role_Numbers near(_numbers, step.near_role), far(_numbers, step.far_role),
            last(_numbers, is_shared ? behind->far_role : nullptr);
        ask(step.association, Operation::ENUMERATE_INSTANCE_NAMES,
            [&](const Path_Value& link, const Instance_Value*) {
                const Path_Value* const start = near.end_of(link);
                const Path_Value* const end = far.end_of(link);
                if (!start || !end || !is_wanted(step.to, *end))
                    return;
                const Number from = near.of(*start);
                if (!is_node(from, step.from))
                    return;
                const Number to = far.of(*end);
                links.push_back({from, 0, to});
                if (const Path_Value* const beyond = last.end_of(link))
                    _kept.push_back({to, from, last.of(*beyond)});
            });
        make_unique(links);
        make_unique(_kept);
    }

    /// By start and what is above it, each far end once, where it first came.
    static void make_unique(std::vector<Link>& links)
    {
        std::vector<std::uint32_t> order(links.size());
        for (std::uint32_t i = 0; i < order.size(); ++i)
            order[i] = i;
        const auto key = [&](std::uint32_t i) {
            return std::tuple(links[i].from, links[i].above, links[i].to);
        };
        std::ranges::sort(order, {}, [&](std::uint32_t i) { return std::tuple_cat(key(i), std::tuple(i)); });
        order.erase(std::unique(order.begin(), order.end(),
                                [&](std::uint32_t a, std::uint32_t b) { return key(a) == key(b); }),
                    order.end());
        std::ranges::sort(order, {},
                          [&](std::uint32_t i) { return std::tuple(links[i].from, links[i].above, i); });
        std::vector<Link> result;
        result.reserve(order.size());
        for (const std::uint32_t i : order)
            result.push_back(links[i]);
        links = std::move(result);
    }

    /// One link for all of a start, to a node that stands for their number.
    std::vector<Link> counted(const std::vector<Link>& links)
    {
        std::vector<Link> result;
        for (std::size_t i = 0, next = 0; i < links.size(); i = next) {
            while (next < links.size() && place(links[next]) == place(links[i]))
                ++next;
            const Number number = static_cast<Number>(std::max(_topology.nodes.size(), _numbers.size()));
            meet(number, Node_Kind::UNITS);
            const Instance_Value units = {
                .properties = {{"Count", Plain_Value::unsigned_number(CMPI_uint64, next - i)}}};
            say(number, units);
            result.push_back({links[i].from, links[i].above, number});
        }
        return result;
    }

    /// With one port named, adapters without it are left out.
    void prune_adapters()
    {
        if (_options.port.empty())
            return;
        std::vector<bool> has_port(_topology.nodes.size());
        for (const Topology::Step_Links& each : _topology.steps)
            if (each.step->from == Node_Kind::ADAPTER &&
                (each.step->to == Node_Kind::FC_PORT || each.step->to == Node_Kind::ETHERNET_PORT))
                for (const Link& link : each.links)
                    has_port[link.from] = true;
        for (Topology::Step_Links& each : _topology.steps)
            if (each.step->to == Node_Kind::ADAPTER)
                std::erase_if(each.links, [&](const Link& link) { return !has_port[link.to]; });
    }

    /// The classes of the nodes, in the order in which they were met.
    void read_instances()
    {
        std::vector<std::string> class_names;
        for (const Topology::Step_Links& each : _topology.steps)
            for (const Link& link : each.links)
                if (link.to < _numbers.size() &&
                    std::ranges::find(class_names, _numbers.class_name(link.to)) == class_names.end())
                    class_names.push_back(_numbers.class_name(link.to));
        for (const std::string& class_name : class_names)
            ask(class_name, Operation::ENUMERATE_INSTANCES,
                [&](const Path_Value& path, const Instance_Value* instance) {
                    keep_text(_numbers.find(path), *instance);
                });
        tell_of_the_missing();
    }

    void keep_text(Number number, const Instance_Value& instance)
    {
        if (number >= _topology.nodes.size() || !_topology.nodes[number].is_met ||
            !_topology.nodes[number].text.empty())
            return;
        say(number, instance);
        if (_options.merge_units && _topology.nodes[number].kind == Node_Kind::UNIT)
            if (const std::string identifier = unit_identifier(instance); !identifier.empty())
                _units[identifier].push_back(number);
    }

    /// The unit that the links meet first stands for all of its identifier.
    void merge_units()
    {
        std::vector<Number> first(_topology.nodes.size());
        for (Number i = 0; i < first.size(); ++i)
            first[i] = i;
        for (const auto& [identifier, numbers] : _units)
            for (const Number number : numbers)
                first[number] = std::ranges::min(numbers);
        for (Topology::Step_Links& each : _topology.steps)
            if (each.step->to == Node_Kind::UNIT) {
                for (Link& link : each.links)
                    link.to = first[link.to];
                make_unique(each.links);
            }
    }

    /// Of nodes that the module has no instance of, their keys are known: they are asked for again.
    void tell_of_the_missing()
    {
        const std::size_t failures = _topology.failures.size();
        for (const Topology::Step_Links& each : _topology.steps) {
            const bool is_complete = std::ranges::none_of(
                each.links, [&](const Link& link) { return _topology.nodes[link.to].text.empty(); });
            if (is_complete)
                continue;
            const Role_Numbers far(_numbers, each.step->far_role);
            ask(each.step->association, Operation::ENUMERATE_INSTANCE_NAMES,
                [&](const Path_Value& link, const Instance_Value*) {
                    if (const Path_Value* const end = far.end_of(link))
                        keep_text(_numbers.find(*end), {*end, end->keys});
                });
        }
        _topology.failures.resize(failures);
    }

    Connection& _connection;
    const Topology_Options& _options;
    Object_Numbers _numbers;
    Topology _topology;
    /// From targets to units, under the initiator that sees them.
    std::vector<Link> _kept;
    /// By identifier, if units are merged.
    std::unordered_map<std::string, std::vector<Number>> _units;
};

} // namespace

std::vector<Number> Topology::below(const Step_Links& step, Number node, Number above) const
{
    std::vector<Number> found;
    if (step.step->from != nodes[node].kind || step.step->taken == Topology_Step::CROSS_LINK)
        return found;
    const std::pair from(node, step.step->above_role ? above : 0);
    for (auto link = std::ranges::lower_bound(step.links, from, {}, place);
         link != step.links.end() && place(*link) == from; ++link)
        found.push_back(link->to);
    return found;
}

std::vector<Number> Topology::below(Number node, Number above) const
{
    std::vector<Number> found;
    for (const Step_Links& each : steps)
        for (const Number number : below(each, node, above))
            found.push_back(number);
    return found;
}

bool has_node(const Topology& topology, std::initializer_list<Node_Kind> kinds)
{
    return std::ranges::any_of(topology.nodes, [&](const Topology::Node& node) {
        return node.is_met && std::ranges::find(kinds, node.kind) != kinds.end();
    });
}

Topology walk_topology(Connection& connection, const Topology_Options& options)
{
    return Walk(connection, options).run();
}

} // namespace KPRV::kldrcim
