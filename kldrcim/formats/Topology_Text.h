#pragma once

#include "kldrcim/walks/Topology.h"

namespace KPRV::kldrcim {

/// What to keep of a node for each way of writing: for `Topology_Options`.
std::string tree_node_text(Node_Kind kind, const Instance_Value& instance, bool color);
std::string json_node_text(Node_Kind kind, const Instance_Value& instance);
std::string graphviz_node_text(Node_Kind kind, const Instance_Value& instance);

/// Writes the tree for people, one line a node, branches drawn with box-drawing characters or in ASCII.
/// Initiators have no line: each is the port above it in another role.
void write_tree(const Topology& topology, bool ascii);

/// The same as nested objects with "kind", "name", "facts", "path" and, unless it is empty, "children"; an
/// array if the roots are not exactly one.
void write_tree_json(const Topology& topology);

/// All nodes and edges in the language of Graphviz, in the order of a walk from the roots; edges that are not
/// of the tree are dashed and do not pull.
void write_graphviz(const Topology& topology);

} // namespace KPRV::kldrcim
