#pragma once

#include "kldrcim/verbs/Result_Filter.h"

#include <algorithm>
#include <span>

namespace KPRV::kldrcim {

/// False with a one-line `error` for a name in --where or --sort that no row of the verb's listing has.
bool check_listing(const Cli_Options& options, std::span<const char* const> names, std::string& error);

/// --count: writes how many rows there are, and true if that is all that is wanted.
bool write_total(const Cli_Options& options, std::size_t count);

/// --where and --sort for listings whose rows are no CIM objects. `values_of` gives what a row has: texts,
/// numbers and lists of them, by the names that its JSON has.
template <class Row, class Values>
void filter_listing(const Cli_Options& options, std::vector<Row>& rows, Values values_of)
{
    std::erase_if(rows, [&](const Row& row) { return !meets_conditions(options, "", values_of(row)); });
    if (!options.sort.empty())
        std::ranges::stable_sort(rows, [&](const Row& a, const Row& b) {
            return sorts_before(options, values_of(a), values_of(b));
        });
}

} // namespace KPRV::kldrcim
