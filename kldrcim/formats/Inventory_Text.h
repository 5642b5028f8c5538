#pragma once

#include "kldrcim/walks/Inventory.h"

namespace KPRV::kldrcim {

/// Reads what `tree_json` writes, of one host. Nothing with a one-line `error` for what is none.
std::optional<Inventory_Node> read_inventory(const std::string& text, std::string& error);

/// One line a change; empty if there is none.
std::string diff_text(const Inventory_Diff& diff);

/// An array of objects, one a change.
std::string diff_json(const Inventory_Diff& diff);

} // namespace KPRV::kldrcim
