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

std::unique_ptr<Result_Writer> make_writer(const Cli_Options& options)
{
    switch (options.format) {
    case Format::JSON:
        return json_writer(words_of(options));
    case Format::JSONL:
        return json_lines_writer(words_of(options));
    case Format::MOF:
        return mof_writer();
    default:
        return table_writer(options.properties ? &*options.properties : nullptr, terminal_width(),
                            words_of(options));
    }
}

void write_instance(const Cli_Options& options, const std::vector<Instance_Value>& instances)
{
    if (instances.empty())
        return;
    if (options.format == Format::JSON)
        put(json_instance(instances.front(), 0, words_of(options)) + "\n");
    else if (options.format == Format::JSONL)
        put(json_line(json_instance(instances.front(), 0, words_of(options))));
    else if (options.format == Format::MOF)
        put(mof_instance(instances.front()));
    else
        put(path_text(instances.front().path) + "\n" +
            values_as_block(instances.front().properties,
                            Class_Words(instances.front().path.class_name, words_of(options))));
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
            values[0].value = Plain_Value::text(worded_text(meanings, result.return_value));
        return put(values_as_block(values));
    }
    for (const Named_Value& value : values)
        put(value.name + " = " + mof_text(value.value) + ";\n");
}

} // namespace KPRV::kldrcim
