#pragma once

#include "kldrcim/words/Value_Words.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Instances for people. With few properties a table, one column each; otherwise, or where the table would be
/// wider than `width`, a block of `Name = value` lines per instance, nulls left out, under its object path.
/// `columns` fixes the properties and their order; null takes them from the instances. Width 0 is unlimited.
class Instances_Table
{
public:
    /// Takes its form and the widths of its columns from the first of its instances, or all.
    Instances_Table(const std::vector<Instance_Value>& first, const std::vector<std::string>* columns,
                    std::size_t width, Words words);

    /// Headings and rule; empty for blocks.
    std::string head() const;
    /// A line, or lines; a cell that is wider than its column moves those behind it.
    std::string row(const Instance_Value& instance) const;
    /// What stands between two rows.
    const char* between() const { return is_of_blocks() ? "\n" : ""; }
    /// False for an instance of which a row would not show all.
    bool has_columns_for(const Instance_Value& instance) const;

private:
    bool is_of_blocks() const { return _widths.empty(); }
    std::vector<std::string> cells(const Instance_Value& instance) const;

    const bool _are_fixed;
    const Words _words;
    const std::vector<std::string> _headings;
    std::vector<std::size_t> _widths;
};

/// All of them.
std::string instances_as_table(const std::vector<Instance_Value>& instances,
                               const std::vector<std::string>* columns, std::size_t width,
                               Words words = Words::SHOWN);

/// Rows under headings, columns padded with spaces and never cut.
std::string rows_as_table(const std::vector<std::string>& headings,
                          const std::vector<std::vector<std::string>>& rows);

/// `Name = value` lines; the names are padded to one width. Nulls are left out.
std::string values_as_block(const std::vector<Named_Value>& values,
                            const Class_Words& words = Class_Words(""));

} // namespace KPRV::kldrcim
