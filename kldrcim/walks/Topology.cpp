#include "kldrcim/walks/Topology.h"

#include "broker/values/Path_Identity.h"
#include "kldrcim/walks/Unit_Paths.h"

#include <set>

namespace KPRV::kldrcim {

namespace {

class Walk
{
public:
    Walk(Association_Index& index, const Topology_Options& options) : index_(index), options_(options) {}

    Topology run()
    {
        for (const Instance_Value& system : index_.instances(topology_root_class))
            topology_.roots.push_back(branch(node_of(Node_Kind::SYSTEM, system.path).first, nullptr));
        if (options_.cross_links)
            add_cross_links();
        return std::move(topology_);
    }

private:
    bool takes(const Topology_Step& step) const
    {
        switch (step.taken) {
        case Topology_Step::WITH_SOFTWARE:
            return options_.software;
        case Topology_Step::WITH_CONNECTORS:
            return options_.connectors;
        case Topology_Step::CROSS_LINK:
            return false;
        default:
            return true;
        }
    }

    /// Equal for what is one node.
    std::string identity_of(Node_Kind kind, const Path_Value& path)
    {
        const std::string identifier =
            options_.merge_units && kind == Node_Kind::UNIT ? unit_identifier(index_.instance(path)) : "";
        return identifier.empty() ? path_identity(path) : "unit " + identifier;
    }

    /// The node of an object, and whether it is new.
    std::pair<std::size_t, bool> node_of(Node_Kind kind, const Path_Value& path)
    {
        auto [at, is_new] = known_.try_emplace(identity_of(kind, path), topology_.nodes.size());
        if (is_new)
            topology_.nodes.push_back({kind, index_.instance(path)});
        return {at->second, is_new};
    }

    void add_edge(std::size_t from, std::size_t to, const char* association, bool in_tree)
    {
        if (edges_.insert({from, to, association}).second)
            topology_.edges.push_back({from, to, association, in_tree});
    }

    std::vector<Path_Value> follow(const Topology_Step& step, std::size_t from, const Path_Value* above)
    {
        return index_.far_ends(step.association, step.near_role, topology_.nodes[from].instance.path,
                               step.far_role, step.above_role, above);
    }

    /// The plan leads from each kind to others only, never back, so that this ends.
    Topology::Branch branch(std::size_t node, const Path_Value* above)
    {
        Topology::Branch result = {node, {}};
        // A copy: the nodes move while children are added.
        const Path_Value path = topology_.nodes[node].instance.path;
        for (const Topology_Step* step = topology_steps; step->association; ++step) {
            if (step->from != topology_.nodes[node].kind || !takes(*step))
                continue;
            for (const Path_Value& end : follow(*step, node, above)) {
                auto [child, is_new] = node_of(step->to, end);
                add_edge(node, child, step->association, is_new);
                result.children.push_back(branch(child, &path));
            }
        }
        return result;
    }

    /// Only between what is drawn anyway.
    void add_cross_links()
    {
        for (const Topology_Step* step = topology_steps; step->association; ++step)
            for (std::size_t i = 0; step->taken == Topology_Step::CROSS_LINK && i < topology_.nodes.size();
                 ++i)
                if (topology_.nodes[i].kind == step->from)
                    for (const Path_Value& end : follow(*step, i, nullptr))
                        if (auto at = known_.find(path_identity(end)); at != known_.end())
                            add_edge(i, at->second, step->association, false);
    }

    Association_Index& index_;
    const Topology_Options& options_;
    Topology topology_;
    std::unordered_map<std::string, std::size_t> known_;
    std::set<std::tuple<std::size_t, std::size_t, std::string>> edges_;
};

} // namespace

Topology walk_topology(Association_Index& index, const Topology_Options& options)
{
    return Walk(index, options).run();
}

} // namespace KPRV::kldrcim
