#include "kldrcim/verbs/Cli_Output.h"

#include "broker/values/Value_Text.h"
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Terminal.h"

namespace KPRV::kldrcim {

namespace {

using Format = Cli_Options::Format;

Words words_of(const Cli_Options& options)
{
    return options.numbers ? Words::LEFT_OUT : Words::SHOWN;
}

} // namespace

void write_instances(const Cli_Options& options, const std::vector<Instance_Value>& instances)
{
    if (options.format == Format::TABLE)
        return put(instances_as_table(instances, options.properties ? &*options.properties : nullptr,
                                      terminal_width(), words_of(options)));
    if (options.format == Format::MOF) {
        for (const Instance_Value& instance : instances)
            put(mof_instance(instance));
        return;
    }
    std::vector<std::string> elements;
    for (const Instance_Value& instance : instances)
        elements.push_back(json_instance(instance, 2, words_of(options)));
    put(json_array(elements) + "\n");
}

void write_instance(const Cli_Options& options, const std::vector<Instance_Value>& instances)
{
    if (instances.empty())
        return;
    if (options.format == Format::JSON)
        put(json_instance(instances.front(), 0, words_of(options)) + "\n");
    else if (options.format == Format::MOF)
        put(mof_instance(instances.front()));
    else
        put(path_text(instances.front().path) + "\n" +
            values_as_block(instances.front().properties,
                            Class_Words(instances.front().path.class_name, words_of(options))));
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

void write_method(const Cli_Options& options, const Request& request, const Result& result)
{
    const Class_Words words(request.path.class_name, words_of(options));
    const auto meanings = words.of(request.method);
    if (options.format == Format::JSON) {
        std::vector<std::pair<std::string, std::string>> members = {
            {"return_value", json_text(result.return_value, 2)}, {"out", json_values(result.out, 2)}};
        if (!meanings.empty())
            members.emplace_back(
                "words", json_object({{"return_value", json_words(meanings, result.return_value)}}, 2));
        return put(json_object(members) + "\n");
    }
    std::vector<Named_Value> values = {{"return_value", result.return_value}};
    values.insert(values.end(), result.out.begin(), result.out.end());
    if (options.format == Format::TABLE) {
        if (!meanings.empty())
            values[0].value = Value::text(worded_text(meanings, result.return_value));
        return put(values_as_block(values));
    }
    for (const Named_Value& value : values)
        put(value.name + " = " + mof_text(value.value) + ";\n");
}

} // namespace KPRV::kldrcim
