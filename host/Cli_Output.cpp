#include "host/Cli_Output.h"

#include "host/Format_Json.h"
#include "host/Format_Table.h"
#include "host/Value_Text.h"

#include <algorithm>
#include <fnmatch.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace KPRV::host {

namespace {

using Format = Cli_Options::Format;

void put(const std::string& text)
{
    std::fwrite(text.data(), 1, text.size(), stdout);
}

/// 0 if standard output is no terminal.
std::size_t terminal_width()
{
    winsize size = {};
    return isatty(STDOUT_FILENO) && ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 ? size.ws_col : 0;
}

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

std::vector<Class_Row> class_rows(const std::string& pattern, const Host& host)
{
    std::vector<Class_Row> rows;
    for (const std::string& name : host.catalogue().class_names()) {
        const Class_Info* info = host.catalogue().find(name);
        if (!info->has_provider || fnmatch(pattern.c_str(), name.c_str(), FNM_CASEFOLD) != 0)
            continue;
        Class_Row& row = rows.emplace_back(Class_Row{info->name, info->superclass, {}, {}});
        for (Mi_Kind kind : mi_kinds)
            if (host.module().factory(name, kind))
                row.kinds.push_back(lower_name(mi_kind_name(kind)));
        for (const Feature_Info& property : info->properties)
            if (property.key)
                row.keys.push_back(property.name);
    }
    std::sort(rows.begin(), rows.end(),
              [](const Class_Row& a, const Class_Row& b) { return a.name < b.name; });
    return rows;
}

std::string json_strings(const std::vector<std::string>& texts)
{
    std::vector<std::string> elements;
    for (const std::string& text : texts)
        elements.push_back(json_string(text));
    return json_array(elements, 4);
}

} // namespace

void write_instances(const Cli_Options& options, const std::vector<Instance_Value>& instances)
{
    if (options.format == Format::TABLE)
        return put(instances_as_table(instances, options.properties ? &*options.properties : nullptr,
                                      terminal_width()));
    if (options.format == Format::MOF) {
        for (const Instance_Value& instance : instances)
            put(mof_instance(instance));
        return;
    }
    std::vector<std::string> elements;
    for (const Instance_Value& instance : instances)
        elements.push_back(json_instance(instance, 2));
    put(json_array(elements) + "\n");
}

void write_instance(const Cli_Options& options, const std::vector<Instance_Value>& instances)
{
    if (instances.empty())
        return;
    if (options.format == Format::JSON)
        put(json_instance(instances.front()) + "\n");
    else if (options.format == Format::MOF)
        put(mof_instance(instances.front()));
    else
        put(path_text(instances.front().path) + "\n" + values_as_block(instances.front().properties));
}

void write_paths(const Cli_Options& options, const std::vector<Path_Value>& paths)
{
    std::vector<std::string> elements;
    for (const Path_Value& path : paths) {
        if (options.format == Format::JSON)
            elements.push_back(json_string(path_text(path)));
        else
            put(path_text(path) + "\n");
    }
    if (options.format == Format::JSON)
        put(json_array(elements) + "\n");
}

void write_method(const Cli_Options& options, const Result& result)
{
    std::vector<Named_Value> values = {{"return_value", result.return_value}};
    if (options.format == Format::JSON)
        return put(json_object({{"return_value", json_text(result.return_value, 2)},
                                {"out", json_values(result.out, 2)}}) +
                   "\n");
    values.insert(values.end(), result.out.begin(), result.out.end());
    if (options.format == Format::TABLE)
        return put(values_as_block(values));
    for (const Named_Value& value : values)
        put(value.name + " = " + mof_text(value.value) + ";\n");
}

void write_classes(const Cli_Options& options, const Host& host)
{
    std::vector<Class_Row> classes = class_rows(options.arguments.empty() ? "*" : options.arguments[0], host);
    if (options.format != Format::JSON) {
        std::vector<std::vector<std::string>> rows;
        for (const Class_Row& row : classes)
            rows.push_back({row.name, row.superclass, joined(row.kinds), joined(row.keys)});
        return put(rows_as_table({"Class", "Superclass", "Provider", "Keys"}, rows));
    }
    std::vector<std::string> elements;
    for (const Class_Row& row : classes)
        elements.push_back(json_object({{"class", json_string(row.name)},
                                        {"superclass", json_string(row.superclass)},
                                        {"provider", json_strings(row.kinds)},
                                        {"keys", json_strings(row.keys)}},
                                       2));
    put(json_array(elements) + "\n");
}

} // namespace KPRV::host
