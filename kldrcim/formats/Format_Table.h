#pragma once

#include "kldrcim/formats/Value_Words.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Instances for people. With few properties a table, one column each; otherwise, or where the table is wider
/// than `width`, a block of `Name = value` lines per instance, nulls left out, under its object path.
/// `columns` fixes the properties and their order; null takes them from the instances. Width 0 is unlimited.
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
