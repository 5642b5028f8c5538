#pragma once

#include "kldrcim/walks/Topology.h"

namespace KPRV::kldrcim {

/// The tree for people, one line a node, branches drawn with box-drawing characters or in ASCII. Initiators
/// have no line: each is the port above it in another role. States are in color if that is wanted.
std::string tree_text(const Topology& topology, bool ascii, bool color);

/// The same as nested objects with "kind", "name", "facts", "path" and, unless it is empty, "children"; an
/// array if the roots are not exactly one.
std::string tree_json(const Topology& topology);

/// All nodes and edges in the language of Graphviz, in the order of the walk; edges that are not of the tree
/// are dashed and do not pull.
std::string graphviz_text(const Topology& topology);

} // namespace KPRV::kldrcim
