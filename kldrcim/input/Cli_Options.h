#pragma once

#include "broker/values/Request.h"
#include "kldrcim/input/Where_Clause.h"

#include <span>

namespace KPRV::kldrcim {

using namespace broker;

/// What stands on the command line of `kldrcim`.
struct Cli_Options
{
    enum class Format
    {
        TABLE,
        JSON,
        /// One object a line.
        JSONL,
        MOF,
        /// The one line of a monitoring plugin.
        PLUGIN,
        /// The two texts of collectors of metrics.
        PROMETHEUS,
        OPENMETRICS,
    };
    enum class Color
    {
        AUTO,
        ALWAYS,
        NEVER,
    };

    enum class Luns
    {
        EACH,
        COUNT,
        MERGED,
    };

    Format format = Format::TABLE;
    /// Otherwise it is the first that the verb has.
    bool is_format_said = false;
    /// Of a tree: on a terminal, unless it is said.
    Color color = Color::AUTO;
    Property_List properties;
    std::string name_space = "root/kaldera";
    /// Empty: look for it.
    std::string module;
    std::optional<std::string> user;
    /// File of what the server's own name spaces hold; empty for none.
    std::string server_instances;
    /// As the four options give it; references take the association class as their result class.
    Association_Filter filter;
    /// What a tree or graph shows besides ports and storage.
    bool software = false;
    bool connectors = false;
    /// Each logical unit, how many, or one that several ports see as one node.
    Luns luns = Luns::EACH;
    /// Levels below the host; 0 for all.
    unsigned depth = 0;
    /// Addresses of the only adapter and port to show; empty for all.
    std::string adapter;
    std::string port;
    /// Name spaces of the filters of a watch; empty: that of the classes.
    std::vector<std::string> filters;
    /// Indications after which a watch ends; 0: never.
    unsigned count = 0;
    /// Seconds between two looks; 0: one look.
    unsigned interval = 0;
    /// Findings and addresses that nobody wants to hear of.
    std::vector<std::string> ignored;
    /// File to write to; empty for standard output.
    std::string output;
    /// Lines of a tree without box-drawing characters.
    bool ascii = false;
    /// rpc: the whole text of a call, or "-" for standard input.
    std::optional<std::string> raw;
    bool list_methods = false;
    /// All must hold of a result.
    std::vector<Where_Clause> conditions;
    /// The property to sort by, with a minus sign before it for the greatest first; empty for the order in
    /// which results come.
    std::string sort;
    /// How many results there are, and nothing else.
    bool total = false;
    /// Numbers alone, without what they mean.
    bool numbers = false;
    /// Follow the job of a test that was started.
    bool wait = false;
    /// Update firmware without asking.
    bool yes = false;
    /// serve: ADDRESS:PORT, files of a certificate and its key, and of who may come in.
    std::string listen;
    std::string tls_certificate;
    std::string tls_key;
    std::string users;
    /// Where subscriptions are kept; empty for nowhere.
    std::string state;
    bool leaks = false;
    bool help = false;
    bool version = false;
    /// Address of a CIM server; empty for a module in this process.
    std::string url;
    std::string password_file;
    std::string ca_file;
    bool insecure = false;
    /// Seconds for which a server may be silent.
    unsigned timeout = 60;
    std::string verb;
    /// What follows the verb.
    std::vector<std::string> arguments;
};

/// One option, as the table of them has it.
struct Cli_Option
{
    const char* name;
    /// What its value is, for the help, or what its two are; null if it takes none.
    const char* value;
    /// False for a value that is none.
    bool (*set)(Cli_Options& options, const std::string& value);
    /// Of an option without value.
    bool Cli_Options::*flag;
    /// What its values are, for one that has bad ones; null if it takes any.
    const char* takes;
    /// All verbs know it; the others name theirs.
    bool is_common;
    const char* summary;
    /// Of the second value of an option that takes two; null for all others.
    bool (*set_second)(Cli_Options& options, const std::string& value) = nullptr;
};

std::span<const Cli_Option> cli_options();

/// As --format takes it.
const char* name_of(Cli_Options::Format format);

/// "NAME=VALUE" apart; false if there is no name or no equals sign.
bool split_assignment(const std::string& text, std::string& name, std::string& value);

/// True if the words, with blanks between them, hold the word.
bool contains_word(const std::string& words, const std::string& word);

} // namespace KPRV::kldrcim
