// What the command line understands, as JSON for those who make something else of it at build time. Never
// installed.
#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli_Verbs.h"

namespace KPRV::kldrcim {
namespace {

std::string text_or_null(const char* text)
{
    return text ? json_string(text) : "null";
}

template <class Wanted>
std::string options_array(Wanted&& wanted)
{
    std::vector<std::string> objects;
    for (const Cli_Option& option : cli_options())
        if (wanted(option))
            objects.push_back(json_object({{"name", json_string(option.name)},
                                           {"value", text_or_null(option.value)},
                                           {"takes", text_or_null(option.takes)},
                                           {"summary", json_string(option.summary)}}));
    return json_array(objects);
}

std::string verbs_array()
{
    std::vector<std::string> objects;
    for (const Cli_Verb& verb : cli_verbs())
        objects.push_back(json_object({{"name", json_string(verb.name)},
                                       {"arguments", json_string(verb.arguments)},
                                       {"formats", json_string(verb.formats)},
                                       {"summary", json_string(verb.summary)},
                                       {"options", options_array([&](const Cli_Option& option) {
                                            return takes_option(verb, option);
                                        })}}));
    return json_array(objects);
}

} // namespace
} // namespace KPRV::kldrcim

int main()
{
    using namespace KPRV::kldrcim;
    put(json_object({{"verbs", verbs_array()},
                     {"common", options_array([](const Cli_Option& option) { return option.is_common; })}}) +
        "\n");
    flush_output();
}
