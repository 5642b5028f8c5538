#include "host/Cli_Options.h"

#include "host/Cli_Rpc.h"
#include "host/Cli_Verbs.h"

#include <algorithm>
#include <charconv>
#include <iterator>

namespace KPRV::host {

namespace {

std::vector<std::string> split_list(const std::string& text)
{
    std::vector<std::string> names;
    std::size_t from = 0;
    while (from <= text.size()) {
        std::size_t comma = std::min(text.find(',', from), text.size());
        if (comma > from)
            names.push_back(text.substr(from, comma - from));
        from = comma + 1;
    }
    return names;
}

bool set_format(Cli_Options& options, const std::string& value)
{
    using Format = Cli_Options::Format;
    static constexpr std::pair<const char*, Format> formats[] = {
        {"table", Format::TABLE}, {"json", Format::JSON}, {"mof", Format::MOF}};
    for (auto [name, format] : formats)
        if (value == name) {
            options.format = format;
            return true;
        }
    return false;
}

/// False for a value that is none.
using Setter = bool (*)(Cli_Options& options, const std::string& value);

/// A text of the options.
template <std::string Cli_Options::*Member>
bool set_text(Cli_Options& options, const std::string& value)
{
    options.*Member = value;
    return true;
}

template <std::string Association_Filter::*Member>
bool set_filter(Cli_Options& options, const std::string& value)
{
    options.filter.*Member = value;
    return true;
}

bool set_properties(Cli_Options& options, const std::string& value)
{
    options.properties = split_list(value);
    return true;
}

bool set_user(Cli_Options& options, const std::string& value)
{
    options.user = value;
    return true;
}

bool add_filter(Cli_Options& options, const std::string& value)
{
    options.filters.push_back(value);
    return !value.empty();
}

bool set_count(Cli_Options& options, const std::string& value)
{
    const char* end = value.data() + value.size();
    const auto [at, error] = std::from_chars(value.data(), end, options.count);
    return error == std::errc() && at == end && options.count != 0;
}

bool set_raw(Cli_Options& options, const std::string& value)
{
    options.raw = value;
    return true;
}

struct Option
{
    const char* name;
    /// Null if the option takes no value.
    Setter set;
    /// Of an option without value.
    bool Cli_Options::*flag;
    /// The verbs that know the option, null for all.
    const char* verbs;
};

using Filter = Association_Filter;

// clang-format off
constexpr Option option_table[] = {
    {"--format",      set_format,                              nullptr,                   nullptr},
    {"--properties",  set_properties,                          nullptr,                   nullptr},
    {"--namespace",   set_text<&Cli_Options::name_space>,      nullptr,                   nullptr},
    {"--module",      set_text<&Cli_Options::module>,          nullptr,                   nullptr},
    {"--user",        set_user,                                nullptr,                   nullptr},
    {"--server-instances", set_text<&Cli_Options::server_instances>, nullptr,             nullptr},
    {"--assoc",       set_filter<&Filter::association_class>,  nullptr,                   "ai ain ri rin"},
    {"--result",      set_filter<&Filter::result_class>,       nullptr,                   "ai ain"},
    {"--role",        set_filter<&Filter::role>,               nullptr,                   "ai ain ri rin"},
    {"--result-role", set_filter<&Filter::result_role>,        nullptr,                   "ai ain"},
    {"--filter",      add_filter,                              nullptr,                   "watch"},
    {"--count",       set_count,                               nullptr,                   "watch"},
    {"--software",    nullptr,                                 &Cli_Options::software,    "tree graph"},
    {"--connectors",  nullptr,                                 &Cli_Options::connectors,  "tree graph"},
    {"--ascii",       nullptr,                                 &Cli_Options::ascii,       "tree profiles"},
    {"--raw",         set_raw,                                 nullptr,                   "rpc"},
    {"--list",        nullptr,                                 &Cli_Options::list_methods, "rpc"},
    {"--wait",        nullptr,                                 &Cli_Options::wait,        "diag"},
    {"--leaks",       nullptr,                                 &Cli_Options::leaks,       nullptr},
    {"--help",        nullptr,                                 &Cli_Options::help,        nullptr},
    {"-h",            nullptr,                                 &Cli_Options::help,        nullptr},
    {"--version",     nullptr,                                 &Cli_Options::version,     nullptr},
};
// clang-format on

const Option* find_option(const std::string& name)
{
    auto at = std::find_if(std::begin(option_table), std::end(option_table),
                           [&](const Option& option) { return name == option.name; });
    return at == std::end(option_table) ? nullptr : &*at;
}

/// What the values of an option are, for one that has bad ones.
const char* words_for(const Option& option)
{
    if (option.set == set_count)
        return "a number above 0";
    return option.set == add_filter ? "a namespace" : "table, json or mof";
}

bool contains_word(const std::string& words, const std::string& word)
{
    return (" " + words + " ").find(" " + word + " ") != std::string::npos;
}

/// An option that the verb would ignore is a mistake of the user, who should hear of it.
bool check_sense(const Cli_Options& options, const std::vector<const Option*>& given, std::string& error)
{
    for (const Option* option : given)
        if (option->verbs && !contains_word(option->verbs, options.verb)) {
            error = std::string(option->name) + " makes no sense for " + options.verb + "; it is for " +
                    option->verbs;
            return false;
        }
    using Format = Cli_Options::Format;
    const bool no_mof = contains_word("tree profiles rpc flash", options.verb);
    if ((options.verb == "graph" && options.format != Format::TABLE) ||
        (no_mof && options.format == Format::MOF)) {
        error = "--format " + std::string(options.format == Format::MOF ? "mof" : "json") +
                " makes no sense for " + options.verb;
        return false;
    }
    return options.verb != "rpc" || check_rpc(options, error);
}

bool check_verb(const Cli_Options& options, std::string& error)
{
    const Cli_Verb* verb = find_verb(options.verb);
    if (options.verb.empty())
        error = "no verb; \"kldrcim --help\" lists them";
    else if (!verb)
        error = "no verb \"" + options.verb + "\"; \"kldrcim --help\" lists them";
    else if (options.arguments.size() < verb->least || options.arguments.size() > verb->most)
        error = std::string("usage: kldrcim [options] ") + verb->name + (*verb->arguments ? " " : "") +
                verb->arguments;
    return error.empty();
}

} // namespace

bool parse_options(const std::vector<std::string>& arguments, Cli_Options& options, std::string& error)
{
    bool options_end = false;
    std::vector<const Option*> given;
    for (std::size_t i = 0; i < arguments.size(); ++i) {
        const std::string& argument = arguments[i];
        if (options_end || argument.size() < 2 || argument[0] != '-') {
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
        const Option* option = find_option(argument.substr(0, equals));
        if (!option || (option->flag && equals != std::string::npos)) {
            error = "no option \"" + argument + "\"; \"kldrcim --help\" lists them";
            return false;
        }
        given.push_back(option);
        if (option->flag) {
            options.*option->flag = true;
            continue;
        }
        if (equals == std::string::npos && i + 1 == arguments.size()) {
            error = std::string(option->name) + " wants a value";
            return false;
        }
        std::string value = equals == std::string::npos ? arguments[++i] : argument.substr(equals + 1);
        if (!option->set(options, value)) {
            error = std::string(option->name) + " takes " + words_for(*option) + ", not \"" + value + "\"";
            return false;
        }
    }
    if (options.help || options.version)
        return true;
    return check_verb(options, error) && check_sense(options, given, error);
}

bool split_assignment(const std::string& text, std::string& name, std::string& value)
{
    std::size_t equals = text.find('=');
    if (equals == std::string::npos || equals == 0)
        return false;
    name = text.substr(0, equals);
    value = text.substr(equals + 1);
    return true;
}

} // namespace KPRV::host
