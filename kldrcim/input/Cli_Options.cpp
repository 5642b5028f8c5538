#include "kldrcim/input/Cli_Options.h"

#include <algorithm>
#include <charconv>
#include <iterator>

namespace KPRV::kldrcim {

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

constexpr std::pair<const char*, Cli_Options::Format> formats[] = {
    {"table", Cli_Options::Format::TABLE},
    {"json", Cli_Options::Format::JSON},
    {"jsonl", Cli_Options::Format::JSONL},
    {"mof", Cli_Options::Format::MOF},
    {"plugin", Cli_Options::Format::PLUGIN},
    {"prometheus", Cli_Options::Format::PROMETHEUS},
    {"openmetrics", Cli_Options::Format::OPENMETRICS},
};
constexpr std::pair<const char*, Cli_Options::Color> colors[] = {
    {"auto", Cli_Options::Color::AUTO},
    {"always", Cli_Options::Color::ALWAYS},
    {"never", Cli_Options::Color::NEVER},
};
constexpr std::pair<const char*, Cli_Options::Luns> lun_words[] = {
    {"each", Cli_Options::Luns::EACH},
    {"count", Cli_Options::Luns::COUNT},
    {"merged", Cli_Options::Luns::MERGED},
};

/// One of a few words.
template <auto Member, auto& Words>
bool set_word(Cli_Options& options, const std::string& value)
{
    for (const auto& [name, meaning] : Words)
        if (value == name) {
            options.*Member = meaning;
            return true;
        }
    return false;
}

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

bool add_ignored(Cli_Options& options, const std::string& value)
{
    options.ignored.push_back(value);
    return !value.empty();
}

bool add_condition(Cli_Options& options, const std::string& value)
{
    return split_where_clause(value, options.conditions.emplace_back());
}

bool set_sort(Cli_Options& options, const std::string& value)
{
    options.sort = value;
    return !value.empty() && value != "-";
}

/// A number above 0.
template <unsigned Cli_Options::*Member>
bool set_number(Cli_Options& options, const std::string& value)
{
    const char* end = value.data() + value.size();
    const auto [at, error] = std::from_chars(value.data(), end, options.*Member);
    return error == std::errc() && at == end && options.*Member != 0;
}

template <std::string Cli_Options::*Member>
bool set_name(Cli_Options& options, const std::string& value)
{
    options.*Member = value;
    return !value.empty();
}

bool set_format(Cli_Options& options, const std::string& value)
{
    options.is_format_said = true;
    return set_word<&Cli_Options::format, formats>(options, value);
}

bool set_output(Cli_Options& options, const std::string& value)
{
    options.output = value;
    return !value.empty();
}

bool set_raw(Cli_Options& options, const std::string& value)
{
    options.raw = value;
    return true;
}

using Filter = Association_Filter;
using Options = Cli_Options;

// clang-format off
constexpr Cli_Option option_table[] = {
//   name            value             set                                  flag                     takes                     common
    {"--format",     "table|json|jsonl|mof|plugin|prometheus|openmetrics", set_format, nullptr,
     "table, json, jsonl, mof, plugin, prometheus or openmetrics", true,
     "how results are written (default: the first that a verb has, mostly table); jsonl is JSON with one result a line"},
    {"--properties", "A,B,C",          set_properties,                      nullptr,                 nullptr,                  true,
     "ask for these properties only"},
    {"--namespace",  "NS",             set_text<&Options::name_space>,      nullptr,                 nullptr,                  true,
     "namespace of the classes (default: root/kaldera)"},
    {"--url",        "URL",            set_text<&Options::url>,             nullptr,                 nullptr,                  true,
     "ask the CIM server at http[s]://[USER@]HOST[:PORT], instead of a module in this process (default: KLDRCIM_URL, if that is set "
     "and --module is not)"},
    {"--password-file", "FILE",        set_text<&Options::password_file>,   nullptr,                 nullptr,                  true,
     "its first line is the password of USER (default: ask at the terminal)"},
    {"--cacert",     "FILE",           set_text<&Options::ca_file>,         nullptr,                 nullptr,                  true,
     "certificates by which the server's may be signed, or those of listeners of serve (default: the system's)"},
    {"--insecure",   nullptr,          nullptr,                             &Options::insecure,      nullptr,                  true,
     "do not look at the server's certificate: whoever answers is believed"},
    {"--timeout",    "SECONDS",        set_number<&Options::timeout>,       nullptr,                 "a number above 0",       true,
     "how long the server may be silent (default: 60; ten times as long in a method)"},
    {"--module",     "FILE",           set_text<&Options::module>,          nullptr,                 nullptr,                  true,
     "provider library (default: libkldrprovider_Module.so beside this program, then in ../lib/cim and /usr/lib/cim, then on "
     "the library search path)"},
    {"--user",       "NAME",           set_user,                            nullptr,                 nullptr,                  true,
     "authenticated user that the provider sees (default: none)"},
    {"--server-instances", "FILE",     set_text<&Options::server_instances>, nullptr,                nullptr,                  true,
     "JSON of what the server's own name spaces hold, for providers that ask the server (default: it has none besides "
     "--namespace)"},
    {"--assoc",      "CLASS",          set_filter<&Filter::association_class>, nullptr,              nullptr,                  false,
     "only this association class and its subclasses (default: every one that can hold the class of PATH)"},
    {"--role",       "ROLE",           set_filter<&Filter::role>,           nullptr,                 nullptr,                  false,
     "only where PATH stands in this role"},
    {"--result",     "CLASS",          set_filter<&Filter::result_class>,   nullptr,                 nullptr,                  false,
     "only results of this class or a subclass"},
    {"--result-role", "ROLE",          set_filter<&Filter::result_role>,    nullptr,                 nullptr,                  false,
     "only results that stand in this role"},
    {"--filter",     "NS",             add_filter,                          nullptr,                 "a namespace",            false,
     "a filter in this namespace, instead of --namespace; may be given several times"},
    {"--where",      "NAME=VALUE",     add_condition,                       nullptr,                 "NAME=VALUE, NAME!=VALUE or NAME~PATTERN", false,
     "only results whose property is VALUE, by number, text or word, is not (NAME!=VALUE), or matches PATTERN, in which * and ? "
     "match as in file names (NAME~PATTERN); of an array any element; may be given several times, and all must hold"},
    {"--sort",       "[-]NAME",        set_sort,                            nullptr,                 "the name of a property, or a minus sign and a name", false,
     "in the order of this property; with a minus sign before it the greatest first"},
    {"--count",      nullptr,          nullptr,                             &Options::total,         nullptr,                  false,
     "how many results there are, and nothing else"},
    {"--count",      "N",              set_number<&Options::count>,         nullptr,                 "a number above 0",       false,
     "end after N indications"},
    {"--software",   nullptr,          nullptr,                             &Options::software,      nullptr,                  false,
     "also firmware and drivers"},
    {"--connectors", nullptr,          nullptr,                             &Options::connectors,    nullptr,                  false,
     "also cards and transceivers"},
    {"--adapter",    "ADDRESS",        set_name<&Options::adapter>,         nullptr,                 "an address",             false,
     "only this adapter, by its DeviceID, with or without colons"},
    {"--port",       "ADDRESS",        set_name<&Options::port>,            nullptr,                 "an address",             false,
     "only this port, by its DeviceID, with or without colons, and its adapter"},
    {"--depth",      "N",              set_number<&Options::depth>,         nullptr,                 "a number above 0",       false,
     "levels below the host: 1 adapters, 2 ports, 3 targets, 4 logical units"},
    {"--luns",       "each|count|merged", set_word<&Options::luns, lun_words>, nullptr,              "each, count or merged",  false,
     "each logical unit (default), or how many a target has; merged: in a graph, one that several ports see is one node"},
    {"--ascii",      nullptr,          nullptr,                             &Options::ascii,         nullptr,                  false,
     "no box-drawing characters (default where the locale is not UTF-8)"},
    {"--color",      "WHEN",           set_word<&Options::color, colors>,   nullptr,                 "auto, always or never",  false,
     "states in colors: auto, always or never (default: auto, on a terminal and without NO_COLOR)"},
    {"--raw",        nullptr,          nullptr,                             &Options::numbers,       nullptr,                  false,
     "numbers alone, without what they mean"},
    {"--interval",   "SECONDS",        set_number<&Options::interval>,      nullptr,                 "a number above 0",       false,
     "look twice, so many seconds apart, at what counts errors"},
    {"--ignore",     "WHAT",           add_ignored,                         nullptr,                 "a finding or an address", false,
     "leave out what is known: a kind of finding, or an adapter, port or target by its address; may be given several times"},
    {"--output",     "FILE",           set_output,                          nullptr,                 "a file name",            false,
     "write into this file, as a whole or not at all, instead of on standard output"},
    {"--raw",        "TEXT",           set_raw,                             nullptr,                 nullptr,                  false,
     "the whole text of a call"},
    {"--list",       nullptr,          nullptr,                             &Options::list_methods,  nullptr,                  false,
     "list the methods"},
    {"--wait",       nullptr,          nullptr,                             &Options::wait,          nullptr,                  false,
     "show the job while it runs, then its records"},
    {"--yes",        nullptr,          nullptr,                             &Options::yes,           nullptr,                  false,
     "do not ask (default where standard input is no terminal)"},
    {"--listen",     "ADDRESS:PORT",   set_text<&Options::listen>,          nullptr,                 nullptr,                  false,
     "where clients connect; port 0 is any free one (default: 127.0.0.1:5988)"},
    {"--tls",        "CERT KEY",       set_text<&Options::tls_certificate>, nullptr,                 nullptr,                  false,
     "files of a certificate and its key (PEM), for HTTPS", set_text<&Options::tls_key>},
    {"--tls-cert",   "FILE",           set_text<&Options::tls_certificate>, nullptr,                 nullptr,                  false,
     "the certificate alone"},
    {"--tls-key",    "FILE",           set_text<&Options::tls_key>,         nullptr,                 nullptr,                  false,
     "its key alone"},
    {"--users",      "FILE",           set_text<&Options::users>,           nullptr,                 nullptr,                  false,
     "lines user:hash of those who may connect, the hash as crypt makes it (default: nobody is asked)"},
    {"--state",      "FILE",           set_text<&Options::state>,           nullptr,                 nullptr,                  false,
     "keeps the clients' subscriptions from one start to the next (default: they end with the program)"},
    {"--leaks",      nullptr,          nullptr,                             &Options::leaks,         nullptr,                  true,
     "say on standard error which CMPI objects the provider did not release"},
    {"--help",       nullptr,          nullptr,                             &Options::help,          nullptr,                  true,
     "this text, or after a verb what there is to know of it"},
    {"--version",    nullptr,          nullptr,                             &Options::version,       nullptr,                  true,
     "the program's version"},
};
// clang-format on

} // namespace

std::span<const Cli_Option> cli_options()
{
    return option_table;
}

const char* name_of(Cli_Options::Format format)
{
    return std::ranges::find(formats, format, &std::pair<const char*, Cli_Options::Format>::second)->first;
}

bool contains_word(const std::string& words, const std::string& word)
{
    return (" " + words + " ").find(" " + word + " ") != std::string::npos;
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

} // namespace KPRV::kldrcim
