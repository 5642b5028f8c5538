#include "kldrcim/formats/Format_Table.h"

#include "broker/values/Type_Words.h"
#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Visible_Text.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

/// More columns than this read better as blocks.
constexpr std::size_t most_columns = 8;

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
            if (!property.value.null &&
                std::none_of(columns.begin(), columns.end(),
                             [&](const std::string& column) { return same_name(column, property.name); }))
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
            line.append(widths[i] - display_width(cells[i]) + 2, ' ');
    }
    return line.substr(0, line.find_last_not_of(' ') + 1) + "\n";
}

std::string as_blocks(const std::vector<Instance_Value>& instances, Words words)
{
    std::string text;
    for (const Instance_Value& instance : instances)
        text += (text.empty() ? "" : "\n") + path_text(instance.path) + "\n" +
                values_as_block(instance.properties, Class_Words(instance.path.class_name, words));
    return text;
}

} // namespace

std::string rows_as_table(const std::vector<std::string>& headings,
                          const std::vector<std::vector<std::string>>& rows)
{
    std::vector<std::size_t> widths = widths_of(headings, rows);
    std::vector<std::string> rule;
    for (std::size_t width : widths)
        rule.emplace_back(width, '-');
    std::string text = row_of(headings, widths) + row_of(rule, widths);
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

std::string instances_as_table(const std::vector<Instance_Value>& instances,
                               const std::vector<std::string>* columns, std::size_t width, Words words)
{
    if (instances.empty())
        return "";
    std::vector<std::string> headings = columns ? *columns : columns_of(instances);
    if (headings.empty() || headings.size() > most_columns)
        return as_blocks(instances, words);
    std::vector<std::vector<std::string>> rows;
    for (const Instance_Value& instance : instances) {
        const Class_Words class_words(instance.path.class_name, words);
        std::vector<std::string>& row = rows.emplace_back();
        for (const std::string& heading : headings) {
            const Value* value = instance.property(heading);
            row.push_back(value && !value->null ? visible_text(worded_text(class_words.of(heading), *value))
                                                : "");
        }
    }
    std::size_t total = 2 * (headings.size() - 1);
    for (std::size_t column : widths_of(headings, rows))
        total += column;
    return width && total > width ? as_blocks(instances, words) : rows_as_table(headings, rows);
}

} // namespace KPRV::kldrcim
