#include "host/Cli_Options.h"

#include <algorithm>
#include <iterator>

namespace KPRV::host {

namespace {

struct Verb
{
    const char* name;
    std::size_t least;
    std::size_t most;
    const char* arguments;
};

constexpr std::size_t any = ~std::size_t(0);

constexpr Verb verbs[] = {
    {"ei", 1, 1, "CLASS"},
    {"ein", 1, 1, "CLASS"},
    {"gi", 1, 1, "PATH"},
    {"ci", 2, any, "CLASS NAME=VALUE..."},
    {"mi", 2, any, "PATH NAME=VALUE..."},
    {"di", 1, 1, "PATH"},
    {"cm", 2, any, "PATH METHOD [NAME=VALUE...]"},
    {"classes", 0, 1, "[PATTERN]"},
};

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

bool set_format(const std::string& value, Cli_Options& options)
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

/// False if the option is unknown.
bool set_flag(const std::string& name, Cli_Options& options)
{
    bool* flag = name == "--leaks"     ? &options.leaks
                 : name == "--help"    ? &options.help
                 : name == "-h"        ? &options.help
                 : name == "--version" ? &options.version
                                       : nullptr;
    if (flag)
        *flag = true;
    return flag != nullptr;
}

bool takes_value(const std::string& name)
{
    static const char* const names[] = {"--format", "--properties", "--namespace", "--module", "--user"};
    return std::find(std::begin(names), std::end(names), name) != std::end(names);
}

bool set_value_option(const std::string& name, const std::string& value, Cli_Options& options,
                      std::string& error)
{
    if (name == "--format" && !set_format(value, options)) {
        error = "--format takes table, json or mof, not \"" + value + "\"";
        return false;
    }
    if (name == "--properties")
        options.properties = split_list(value);
    else if (name == "--namespace")
        options.name_space = value;
    else if (name == "--module")
        options.module = value;
    else if (name == "--user")
        options.user = value;
    return true;
}

bool check_verb(const Cli_Options& options, std::string& error)
{
    if (options.help || options.version)
        return true;
    auto verb = std::find_if(std::begin(verbs), std::end(verbs),
                             [&](const Verb& candidate) { return options.verb == candidate.name; });
    if (options.verb.empty())
        error = "no verb; \"kldrcim --help\" lists them";
    else if (verb == std::end(verbs))
        error = "no verb \"" + options.verb + "\"; \"kldrcim --help\" lists them";
    else if (options.arguments.size() < verb->least || options.arguments.size() > verb->most)
        error = std::string("usage: kldrcim [options] ") + verb->name + " " + verb->arguments;
    return error.empty();
}

} // namespace

bool parse_options(const std::vector<std::string>& arguments, Cli_Options& options, std::string& error)
{
    bool options_end = false;
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
        std::string name = argument.substr(0, equals);
        if (!takes_value(name)) {
            if (equals == std::string::npos && set_flag(name, options))
                continue;
            error = "no option \"" + argument + "\"; \"kldrcim --help\" lists them";
            return false;
        }
        if (equals == std::string::npos && i + 1 == arguments.size()) {
            error = name + " wants a value";
            return false;
        }
        std::string value = equals == std::string::npos ? arguments[++i] : argument.substr(equals + 1);
        if (!set_value_option(name, value, options, error))
            return false;
    }
    return check_verb(options, error);
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
