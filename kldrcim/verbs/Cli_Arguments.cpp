#include "kldrcim/verbs/Cli_Arguments.h"

#include "kldrcim/input/Nearest_Word.h"
#include "kldrcim/verbs/Cli_Health.h"
#include "kldrcim/verbs/Cli_Help.h"
#include "kldrcim/verbs/Cli_Rpc.h"
#include "kldrcim/verbs/Cli_Verbs.h"
#include "kldrcim/verbs/Result_Filter.h"

#include <algorithm>

namespace KPRV::kldrcim {

namespace {

/// Two options may share a name, for different verbs; where the verb is none of these, or null, the first
/// stands for both. Null for what is no option.
const Cli_Option* find_option(const std::string& written, const Cli_Verb* verb)
{
    const std::string name = written == "-h" ? "--help" : written;
    const Cli_Option* found = nullptr;
    for (const Cli_Option& option : cli_options())
        if (name == option.name && (!found || (verb && takes_option(*verb, option))))
            found = &option;
    return found;
}

bool is_option(const std::string& argument)
{
    return argument.size() >= 2 && argument[0] == '-';
}

/// True if the option is another one for some verb. Its value, if it has one, is no verb.
bool depends_on_verb(const std::string& name)
{
    return std::ranges::count(cli_options(), name, &Cli_Option::name) > 1;
}

/// The verb of a command line whose options may stand before it; null if there is none.
const Cli_Verb* verb_among(const std::vector<std::string>& arguments)
{
    for (std::size_t i = 0; i < arguments.size() && arguments[i] != "--"; ++i) {
        if (!is_option(arguments[i]))
            return find_verb(arguments[i]);
        const Cli_Option* const option = find_option(arguments[i], nullptr);
        if (!option || i + 1 == arguments.size())
            continue;
        if (depends_on_verb(arguments[i]) ? !is_option(arguments[i + 1]) && !find_verb(arguments[i + 1])
                                          : !option->flag)
            i += option->set_second ? 2 : 1;
    }
    return nullptr;
}

template <class Rows>
std::vector<std::string> names_of(const Rows& rows)
{
    std::vector<std::string> names;
    for (const auto& row : rows)
        names.push_back(row.name);
    return names;
}

std::string unknown_option(const std::string& argument)
{
    return "no option \"" + argument + "\"" +
           suggestion(argument.substr(0, argument.find('=')), names_of(cli_options())) +
           "; \"kldrcim --help\" lists them";
}

/// Those that know an option of that name.
std::string verbs_with(const std::string& name)
{
    std::string names;
    for (const Cli_Verb& verb : cli_verbs())
        if (std::ranges::any_of(cli_options(), [&](const Cli_Option& option) {
                return name == option.name && takes_option(verb, option);
            }))
            names += (names.empty() ? "" : " ") + std::string(verb.name);
    return names;
}

/// An option that the verb would ignore is a mistake of the user, who should hear of it.
bool check_sense(const Cli_Options& options, const Cli_Verb& verb,
                 const std::vector<const Cli_Option*>& given, std::string& error)
{
    for (const Cli_Option* option : given)
        if (!option->is_common && !takes_option(verb, *option)) {
            error = std::string(option->name) + " makes no sense for " + verb.name + "; it is for " +
                    verbs_with(option->name);
            return false;
        }
    const char* const format = name_of(options.format);
    if (options.is_format_said && !contains_word(verb.formats, format)) {
        error = "--format " + std::string(format) + " makes no sense for " + verb.name;
        return false;
    }
    return true;
}

bool check_verb(const Cli_Options& options, const Cli_Verb* verb, std::string& error)
{
    if (options.verb.empty())
        error = "no verb; \"kldrcim --help\" lists them";
    else if (!verb)
        error = "no verb \"" + options.verb + "\"" + suggestion(options.verb, names_of(cli_verbs())) +
                "; \"kldrcim --help\" lists them";
    return error.empty();
}

bool check_arguments(const Cli_Options& options, const Cli_Verb& verb, std::string& error)
{
    if (options.arguments.size() < verb.least || options.arguments.size() > verb.most)
        error = usage_line(verb);
    return error.empty() && (options.verb != "rpc" || check_rpc(options, error)) &&
           check_health_options(options, error) && check_filter_options(options, error);
}

} // namespace

bool parse_options(const std::vector<std::string>& arguments, Cli_Options& options, std::string& error)
{
    bool options_end = false;
    const Cli_Verb* const named = verb_among(arguments);
    std::vector<const Cli_Option*> given;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const std::string& argument = arguments[i];
        if (options_end || !is_option(argument)) {
            if (options.verb.empty())
                options.verb = argument;
            else
                options.arguments.push_back(argument);
            continue;
        }
        if (argument == "--") {
            options_end = true;
            continue;
        }
        std::size_t equals = argument.find('=');
        const Cli_Option* option = find_option(argument.substr(0, equals), named);
        if (!option) {
            error = unknown_option(argument);
            return false;
        }
        if (option->flag && equals != std::string::npos) {
            error = std::string(option->name) + " takes no value";
            return false;
        }
        given.push_back(option);
        if (option->flag) {
            options.*option->flag = true;
            continue;
        }
        if (option->set_second && (equals != std::string::npos || i + 2 >= arguments.size())) {
            error = std::string(option->name) + " wants two values: " + option->value;
            return false;
        }
        if (equals == std::string::npos && i + 1 == arguments.size()) {
            error = std::string(option->name) + " wants a value";
            return false;
        }
        std::string value = equals == std::string::npos ? arguments[++i] : argument.substr(equals + 1);
        if (!option->set(options, value)) {
            error = std::string(option->name) + " takes " + option->takes + ", not \"" + value + "\"";
            return false;
        }
        if (option->set_second)
            option->set_second(options, arguments[++i]);
    }
    if (options.version || (options.help && options.verb.empty()))
        return true;
    const Cli_Verb* const verb = find_verb(options.verb);
    if (!check_verb(options, verb, error))
        return false;
    return options.help ||
           (check_arguments(options, *verb, error) && check_sense(options, *verb, given, error));
}

} // namespace KPRV::kldrcim
