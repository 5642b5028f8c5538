#include "kldrcim/formats/Format_Table.h"

#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Visible_Text.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

/// More columns than this read better as blocks.
constexpr std::size_t MOST_COLUMNS = 8;

/// Columns on a terminal: the bytes of a UTF-8 sequence behind its first do not count.
std::size_t display_width(const std::string& text)
{
    return static_cast<std::size_t>(
        std::count_if(text.begin(), text.end(), [](char c) { return (c & 0xC0) != 0x80; }));
}

std::vector<std::string> columns_of(const std::vector<Instance_Value>& instances)
{
    std::vector<std::string> columns;
    for (const Instance_Value& instance : instances)
        for (const Named_Value& property : instance.properties)
            if (!property.value.null && !contains_name(columns, property.name))
                columns.push_back(property.name);
    return columns;
}

std::vector<std::size_t> widths_of(const std::vector<std::string>& headings,
                                   const std::vector<std::vector<std::string>>& rows)
{
    std::vector<std::size_t> widths;
    for (std::size_t i = 0; i < headings.size(); ++i) {
        std::size_t width = display_width(headings[i]);
        for (const auto& row : rows)
            width = std::max(width, display_width(row[i]));
        widths.push_back(width);
    }
    return widths;
}

std::string row_of(const std::vector<std::string>& cells, const std::vector<std::size_t>& widths)
{
    std::string line;
    for (std::size_t i = 0; i < cells.size(); ++i) {
        line += cells[i];
        if (i + 1 < cells.size())
            line.append(std::max(widths[i], display_width(cells[i])) - display_width(cells[i]) + 2, ' ');
    }
    return line.substr(0, line.find_last_not_of(' ') + 1) + "\n";
}

std::string head_of(const std::vector<std::string>& headings, const std::vector<std::size_t>& widths)
{
    std::vector<std::string> rule;
    rule.reserve(widths.size());
    for (const std::size_t width : widths)
        rule.emplace_back(width, '-');
    return row_of(headings, widths) + row_of(rule, widths);
}

} // namespace

std::string rows_as_table(const std::vector<std::string>& headings,
                          const std::vector<std::vector<std::string>>& rows)
{
    std::vector<std::size_t> widths = widths_of(headings, rows);
    std::string text = head_of(headings, widths);
    for (const auto& row : rows)
        text += row_of(row, widths);
    return text;
}

std::string values_as_block(const std::vector<Named_Value>& values, const Class_Words& words)
{
    std::size_t width = 0;
    for (const Named_Value& entry : values)
        if (!entry.value.null)
            width = std::max(width, entry.name.size());
    std::string text;
    for (const Named_Value& entry : values)
        if (!entry.value.null)
            text += "  " + entry.name + std::string(width - entry.name.size(), ' ') + " = " +
                    visible_lines(worded_text(words.of(entry.name), entry.value)) + "\n";
    return text;
}

Instances_Table::Instances_Table(const std::vector<Instance_Value>& first,
                                 const std::vector<std::string>* columns, std::size_t width, Words words)
    : _are_fixed(columns), _words(words), _headings(columns ? *columns : columns_of(first))
{
    if (_headings.empty() || _headings.size() > MOST_COLUMNS)
        return;
    std::vector<std::vector<std::string>> rows;
    rows.reserve(first.size());
    for (const Instance_Value& instance : first)
        rows.push_back(cells(instance));
    _widths = widths_of(_headings, rows);
    std::size_t total = 2 * (_headings.size() - 1);
    for (const std::size_t column : _widths)
        total += column;
    if (width && total > width)
        _widths.clear();
}

std::vector<std::string> Instances_Table::cells(const Instance_Value& instance) const
{
    const Class_Words class_words(instance.path.class_name, _words);
    std::vector<std::string> row;
    for (const std::string& heading : _headings) {
        const Plain_Value* value = instance.property(heading);
        row.push_back(value && !value->null ? visible_text(worded_text(class_words.of(heading), *value))
                                            : "");
    }
    return row;
}

std::string Instances_Table::head() const
{
    return is_of_blocks() ? "" : head_of(_headings, _widths);
}

std::string Instances_Table::row(const Instance_Value& instance) const
{
    return is_of_blocks()
               ? path_text(instance.path) + "\n" +
                     values_as_block(instance.properties, Class_Words(instance.path.class_name, _words))
               : row_of(cells(instance), _widths);
}

bool Instances_Table::has_columns_for(const Instance_Value& instance) const
{
    return _are_fixed || is_of_blocks() ||
           std::ranges::all_of(instance.properties, [&](const Named_Value& property) {
               return property.value.null || contains_name(_headings, property.name);
           });
}

std::string instances_as_table(const std::vector<Instance_Value>& instances,
                               const std::vector<std::string>* columns, std::size_t width, Words words)
{
    if (instances.empty())
        return "";
    const Instances_Table table(instances, columns, width, words);
    std::string text = table.head();
    for (const Instance_Value& instance : instances)
        text += (&instance == &instances.front() ? "" : table.between()) + table.row(instance);
    return text;
}

} // namespace KPRV::kldrcim
