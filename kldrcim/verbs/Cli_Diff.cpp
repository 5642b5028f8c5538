#include "kldrcim/verbs/Cli_Diff.h"

#include "kldrcim/formats/Inventory_Text.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Text_File.h"
#include "kldrcim/verbs/Cli_Complaints.h"

namespace KPRV::kldrcim {

namespace {

constexpr int DIFFERENT = 1;

std::optional<Inventory_Node> inventory_of_file(const std::string& name)
{
    std::string error;
    const auto text = read_text_file(name, error);
    auto inventory = text ? read_inventory(*text, error) : std::nullopt;
    if (!inventory)
        complain((name == "-" ? "standard input" : name) + ": " + error, USAGE_ERROR);
    return inventory;
}

} // namespace

int diff_inventories(const Cli_Options& options)
{
    if (options.arguments[0] == "-" && options.arguments[1] == "-")
        return complain("only one inventory can come from standard input", USAGE_ERROR);
    const auto before = inventory_of_file(options.arguments[0]);
    const auto now = before ? inventory_of_file(options.arguments[1]) : std::nullopt;
    if (!now)
        return USAGE_ERROR;
    const Inventory_Diff diff = compare_inventories(*before, *now);
    if (diff.two_hosts)
        complain("warning: no adapter is in both; targets and logical units are compared without their ports",
                 0);
    if (diff.without_software)
        complain("warning: one of them has no software, which was not compared (tree --software)", 0);
    if (diff.without_connectors)
        complain("warning: one of them has no connectors, which were not compared (tree --connectors)", 0);
    put(options.format == Cli_Options::Format::JSON ? diff_json(diff) : diff_text(diff));
    return diff.changes.empty() ? 0 : DIFFERENT;
}

} // namespace KPRV::kldrcim
