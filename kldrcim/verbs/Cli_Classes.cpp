#include "kldrcim/verbs/Cli_Classes.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/verbs/Listing_Filter.h"

#include <algorithm>
#include <fnmatch.h>

namespace KPRV::kldrcim {

namespace {

std::string joined(const std::vector<std::string>& words)
{
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() ? "" : ", ") + word;
    return text;
}

struct Class_Row
{
    std::string name;
    std::string superclass;
    std::vector<std::string> kinds;
    std::vector<std::string> keys;
};

std::vector<Class_Row> class_rows(const std::string& pattern, Connection& connection)
{
    std::vector<Class_Row> rows;
    for (const std::string& name : connection.classes().class_names()) {
        const Class_Info* info = connection.classes().find(name);
        if (!info->has_provider || fnmatch(pattern.c_str(), name.c_str(), FNM_CASEFOLD) != 0)
            continue;
        Class_Row& row =
            rows.emplace_back(Class_Row{info->name, info->superclass, connection.provider_kinds(name), {}});
        for (const Feature_Info& property : info->properties)
            if (property.key)
                row.keys.push_back(property.name);
    }
    std::sort(rows.begin(), rows.end(),
              [](const Class_Row& a, const Class_Row& b) { return a.name < b.name; });
    return rows;
}

constexpr const char* listed_names[] = {"class", "superclass", "provider", "keys"};

Plain_Value list_of(const std::vector<std::string>& words)
{
    std::vector<Plain_Value> texts;
    texts.reserve(words.size());
    for (const std::string& word : words)
        texts.push_back(Plain_Value::text(word));
    return Plain_Value::array(CMPI_string, std::move(texts));
}

std::vector<Named_Value> values_of(const Class_Row& row)
{
    return {{listed_names[0], Plain_Value::text(row.name)},
            {listed_names[1], Plain_Value::text(row.superclass)},
            {listed_names[2], list_of(row.kinds)},
            {listed_names[3], list_of(row.keys)}};
}

std::string json_strings(const std::vector<std::string>& texts)
{
    std::vector<std::string> elements;
    elements.reserve(texts.size());
    for (const std::string& text : texts)
        elements.push_back(json_string(text));
    return json_array(elements, 4);
}

std::string class_json(const Class_Row& row, unsigned indent)
{
    return json_object({{"class", json_string(row.name)},
                        {"superclass", json_string(row.superclass)},
                        {"provider", json_strings(row.kinds)},
                        {"keys", json_strings(row.keys)}},
                       indent);
}

std::string table_of(const std::vector<Class_Row>& classes)
{
    std::vector<std::vector<std::string>> rows;
    rows.reserve(classes.size());
    for (const Class_Row& row : classes)
        rows.push_back({row.name, row.superclass, joined(row.kinds), joined(row.keys)});
    return rows_as_table({"Class", "Superclass", "Provider", "Keys"}, rows);
}

} // namespace

int list_classes(const Cli_Options& options, Connection& connection)
{
    std::string error;
    if (!check_listing(options, listed_names, error))
        return complain(error, USAGE_ERROR);
    if (!connection.classes().is_known())
        return complain(connection.location() + " does not publish its classes", 0);
    std::vector<Class_Row> classes =
        class_rows(options.arguments.empty() ? "*" : options.arguments[0], connection);
    filter_listing(options, classes, values_of);
    if (write_total(options, classes.size()))
        return 0;
    if (options.format == Cli_Options::Format::TABLE) {
        put(table_of(classes));
        return 0;
    }
    std::vector<std::string> elements;
    elements.reserve(classes.size());
    for (const Class_Row& row : classes)
        elements.push_back(class_json(row, 2));
    if (options.format == Cli_Options::Format::JSON) {
        put(json_array(elements) + "\n");
        return 0;
    }
    for (const std::string& element : elements)
        put(json_line(element));
    return 0;
}

} // namespace KPRV::kldrcim
