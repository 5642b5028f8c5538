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
        : options_(options), class_name_(class_name), each_(std::move(each))
    {
        tell();
    }

    bool instance(Instance_Value&& instance) override { return take(instance.path, &instance); }
    bool path(Path_Value&& path) override { return take(path, nullptr); }

private:
    bool take(const Path_Value& path, const Instance_Value* instance)
    {
        each_(path, instance);
        if (++count_ % 256 == 0)
            tell();
        return true;
    }
    void tell() const
    {
        if (options_.progress)
            options_.progress(class_name_, count_);
    }

    const Topology_Options& options_;
    const std::string& class_name_;
    Each each_;
    std::size_t count_ = 0;
};

/// Numbers of the objects that a role of an association holds: neighbours often share them.
class Role_Numbers
{
public:
    Role_Numbers(Object_Numbers& numbers, const char* role) : numbers_(numbers), role_(role) {}

    /// Null if the link has no such end.
    const Path_Value* end_of(const Path_Value& link) const
    {
        const Value* const value = role_ ? link.key(role_) : nullptr;
        return value ? value->as_path() : nullptr;
    }
    Number of(const Path_Value& end)
    {
        if (last_ == Object_Numbers::none || !(end == path_)) {
            last_ = numbers_.of(end);
            path_ = end;
        }
        return last_;
    }

private:
    Object_Numbers& numbers_;
    const char* role_;
    Path_Value path_;
    Number last_ = Object_Numbers::none;
};

class Walk
{
public:
    Walk(Connection& connection, const Topology_Options& options) : connection_(connection), options_(options)
    {
    }

    Topology run()
    {
        ask(topology_root_class, Operation::ENUMERATE_INSTANCES,
            [&](const Path_Value& path, const Instance_Value* system) {
                const Number number = numbers_.of(path);
                meet(number, Node_Kind::SYSTEM);
                topology_.nodes[number].text = options_.text_of(Node_Kind::SYSTEM, *system);
                topology_.roots.push_back(number);
            });
        for (const Topology_Step* step = topology_steps; step->association; ++step)
            if (takes(*step))
                follow(*step);
        prune_adapters();
        read_instances();
        if (options_.merge_units)
            merge_units();
        return std::move(topology_);
    }

private:
    bool takes(const Topology_Step& step) const
    {
        if (options_.depth != 0 && depth_of(step.to) > options_.depth)
            return false;
        switch (step.taken) {
        case Topology_Step::WITH_SOFTWARE:
            return options_.software;
        case Topology_Step::WITH_CONNECTORS:
            return options_.connectors;
        case Topology_Step::CROSS_LINK:
            return options_.cross_links;
        default:
            return true;
        }
    }

    template <class Each>
    void ask(const std::string& class_name, Operation operation, Each each)
    {
        Each_Of<Each> receiver(options_, class_name, std::move(each));
        Request request;
        request.operation = operation;
        request.path.class_name = class_name;
        if (operation == Operation::ENUMERATE_INSTANCES)
            request.properties = options_.properties;
        const Result result = connection_.run(request, &receiver);
        if (!result.ok())
            topology_.failures.push_back({class_name, result.rc, result.message});
    }

    bool is_node(Number number, Node_Kind kind) const
    {
        return number < topology_.nodes.size() && topology_.nodes[number].is_met &&
               topology_.nodes[number].kind == kind;
    }

    void meet(Number number, Node_Kind kind)
    {
        if (number >= topology_.nodes.size())
            topology_.nodes.resize(std::max<std::size_t>(number + 1, numbers_.size()));
        Topology::Node& node = topology_.nodes[number];
        if (!node.is_met)
            node = {kind, true, {}};
    }

    /// False for an adapter or port that is not the one that was named.
    bool is_wanted(Node_Kind kind, const Path_Value& path) const
    {
        const bool is_port = kind == Node_Kind::FC_PORT || kind == Node_Kind::ETHERNET_PORT;
        const std::string& wanted = kind == Node_Kind::ADAPTER ? options_.adapter
                                    : is_port                  ? options_.port
                                                               : "";
        const Value* const id = path.key("DeviceID");
        return wanted.empty() || (id && address_digits(id->as_text()) == address_digits(wanted));
    }

    /// The links of the step from what was met. An association that two steps follow was kept by the first.
    void follow(const Topology_Step& step)
    {
        if (!has_node(topology_, {step.from}))
            return;
        Topology::Step_Links found = {&step, {}};
        if (step.above_role)
            found.links = std::move(kept_);
        else
            read_links(step, found.links);
        // Each far end once for each start, where it first came.
        if (step.taken == Topology_Step::CROSS_LINK)
            std::erase_if(found.links, [&](const Link& link) { return !is_node(link.to, step.to); });
        if (step.to == Node_Kind::UNIT && options_.count_units)
            found.links = counted(found.links);
        else
            for (const Link& link : found.links)
                meet(link.to, step.to);
        topology_.steps.push_back(std::move(found));
    }

    void read_links(const Topology_Step& step, std::vector<Link>& links)
    {
        // A path names initiator, target and unit at once: the unit is kept for the step behind.
        const Topology_Step* const behind = &step + 1;
        const bool is_shared = behind->above_role && takes(*behind);
        Role_Numbers near(numbers_, step.near_role), far(numbers_, step.far_role),
            last(numbers_, is_shared ? behind->far_role : nullptr);
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
                    kept_.push_back({to, from, last.of(*beyond)});
            });
        make_unique(links);
        make_unique(kept_);
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
            const Number number = static_cast<Number>(std::max(topology_.nodes.size(), numbers_.size()));
            meet(number, Node_Kind::UNITS);
            const Instance_Value units = {
                .properties = {{"Count", Value::unsigned_number(CMPI_uint64, next - i)}}};
            topology_.nodes[number].text = options_.text_of(Node_Kind::UNITS, units);
            result.push_back({links[i].from, links[i].above, number});
        }
        return result;
    }

    /// With one port named, adapters without it are left out.
    void prune_adapters()
    {
        if (options_.port.empty())
            return;
        std::vector<bool> has_port(topology_.nodes.size());
        for (const Topology::Step_Links& each : topology_.steps)
            if (each.step->from == Node_Kind::ADAPTER &&
                (each.step->to == Node_Kind::FC_PORT || each.step->to == Node_Kind::ETHERNET_PORT))
                for (const Link& link : each.links)
                    has_port[link.from] = true;
        for (Topology::Step_Links& each : topology_.steps)
            if (each.step->to == Node_Kind::ADAPTER)
                std::erase_if(each.links, [&](const Link& link) { return !has_port[link.to]; });
    }

    /// The classes of the nodes, in the order in which they were met.
    void read_instances()
    {
        std::vector<std::string> class_names;
        for (const Topology::Step_Links& each : topology_.steps)
            for (const Link& link : each.links)
                if (link.to < numbers_.size() &&
                    std::ranges::find(class_names, numbers_.class_name(link.to)) == class_names.end())
                    class_names.push_back(numbers_.class_name(link.to));
        for (const std::string& class_name : class_names)
            ask(class_name, Operation::ENUMERATE_INSTANCES,
                [&](const Path_Value& path, const Instance_Value* instance) {
                    keep_text(numbers_.find(path), *instance);
                });
        tell_of_the_missing();
    }

    void keep_text(Number number, const Instance_Value& instance)
    {
        if (number >= topology_.nodes.size() || !topology_.nodes[number].is_met ||
            !topology_.nodes[number].text.empty())
            return;
        topology_.nodes[number].text = options_.text_of(topology_.nodes[number].kind, instance);
        if (options_.merge_units && topology_.nodes[number].kind == Node_Kind::UNIT)
            if (const std::string identifier = unit_identifier(instance); !identifier.empty())
                units_[identifier].push_back(number);
    }

    /// The unit that the links meet first stands for all of its identifier.
    void merge_units()
    {
        std::vector<Number> first(topology_.nodes.size());
        for (Number i = 0; i < first.size(); ++i)
            first[i] = i;
        for (const auto& [identifier, numbers] : units_)
            for (const Number number : numbers)
                first[number] = std::ranges::min(numbers);
        for (Topology::Step_Links& each : topology_.steps)
            if (each.step->to == Node_Kind::UNIT) {
                for (Link& link : each.links)
                    link.to = first[link.to];
                make_unique(each.links);
            }
    }

    /// Of nodes that the module has no instance of, their keys are known: they are asked for again.
    void tell_of_the_missing()
    {
        const std::size_t failures = topology_.failures.size();
        for (const Topology::Step_Links& each : topology_.steps) {
            const bool is_complete = std::ranges::none_of(
                each.links, [&](const Link& link) { return topology_.nodes[link.to].text.empty(); });
            if (is_complete)
                continue;
            const Role_Numbers far(numbers_, each.step->far_role);
            ask(each.step->association, Operation::ENUMERATE_INSTANCE_NAMES,
                [&](const Path_Value& link, const Instance_Value*) {
                    if (const Path_Value* const end = far.end_of(link))
                        keep_text(numbers_.find(*end), {*end, end->keys});
                });
        }
        topology_.failures.resize(failures);
    }

    Connection& connection_;
    const Topology_Options& options_;
    Object_Numbers numbers_;
    Topology topology_;
    /// From targets to units, under the initiator that sees them.
    std::vector<Link> kept_;
    /// By identifier, if units are merged.
    std::unordered_map<std::string, std::vector<Number>> units_;
};

} // namespace

std::vector<Number> Topology::below(const Step_Links& step, Number node, Number above) const
{
    std::vector<Number> found;
    if (step.step->from == nodes[node].kind && step.step->taken != Topology_Step::CROSS_LINK)
        for (const Link& link : std::ranges::equal_range(
                 step.links, std::pair(node, step.step->above_role ? above : 0), {}, place))
            found.push_back(link.to);
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
