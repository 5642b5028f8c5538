#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

namespace KPRV::kldrcim {

using namespace broker;

/// The host's adapters and what lies behind them, found by following associations, as lines of a tree or in
/// JSON. Status 1 without the host's own system; other answers that are missing are warned of.
int draw_tree(const Cli_Options& options, Connection& connection);

/// The same as Graphviz text, with the links that a tree cannot show.
int draw_graph(const Cli_Options& options, Connection& connection);

} // namespace KPRV::kldrcim
