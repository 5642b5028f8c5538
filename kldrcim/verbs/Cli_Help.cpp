// The help, from the tables of verbs and options.
#include "kldrcim/verbs/Cli_Help.h"

#include <algorithm>
#include <sstream>

namespace KPRV::kldrcim {

namespace {

constexpr std::size_t WIDTH = 80;

constexpr const char* paths_and_values =
    R"(PATH is [namespace:]Class.Key="text",Key2=42,Key3=true; inside a text, \" and \\ stand for a quote and a backslash. )"
    R"(A key that refers to another object holds its path as text: Ref="Class.Key=\"text\"".
VALUE is read as the class declares it: text as it stands, numbers in decimal or 0x form, true or false, the 25 characters )"
    R"(of a datetime, a PATH for a reference. An array is {one, two}; NULL gives no value.)";

constexpr const char* parameters_of_rpc =
    R"(One word that begins with [ is the JSON array of all parameters. Otherwise each word is one: JSON if it begins with [, { )"
    R"(or a quote; a string where --list says so; else a number, true, false or null if it is one, or a string. Before a )"
    R"(parameter that begins with a minus sign, "--" ends the options.)";

constexpr const char* exit_status =
    R"(0 success, also if only some of several associations failed (a warning names them), or if the reader of a pipe has gone.
1 the provider or the host answered a CIM status, the agent an error, or an update failed, which is named on standard error; )"
    R"(the output could not be written.
2 usage, no such test, element or adapter, or the module could not be loaded, the server not be asked.)";

constexpr const char* examples = R"examples(
  kldrcim ei KALDERA_FCPort --properties DeviceID,PortType,Speed
  kldrcim ein KALDERA_FCPort
  kldrcim ei KALDERA_FCPort --where 'OperationalStatus!=In Service'
  kldrcim ain "$(kldrcim ein KALDERA_ComputerSystem)" \
      --assoc KALDERA_PortControllerSystemDevice
  kldrcim tree --software
  kldrcim health --interval 10
  kldrcim metrics --output /var/lib/prometheus/node-exporter/kldr.prom
  kldrcim diag run SerdesLoopbackTest 10:00:02:4b:4c:10:00:00 --wait
  kldrcim watch --count 10 --properties Message,PerceivedSeverity,MessageID
  kldrcim rpc discovery.getPortByWwn 10:00:02:4b:4c:10:00:00
  kldrcim flash 20:00:02:4b:4c:10:00:00 file:///var/tmp/firmware.bin
  kldrcim --format mof gi 'KALDERA_AgentService.Name="agent"'
)examples";

std::vector<std::string> lines_of(const std::string& text)
{
    std::istringstream stream(text);
    std::vector<std::string> lines;
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    if (lines.empty())
        lines.emplace_back();
    return lines;
}

/// The words of the text from column `indent` on; the first line begins behind what stands there already.
std::string wrapped(const std::string& text, std::size_t indent)
{
    std::string result;
    std::size_t column = indent;
    std::istringstream words(text);
    for (std::string word; words >> word;) {
        if (column > indent && column + 1 + word.size() > WIDTH) {
            result += "\n" + std::string(indent, ' ');
            column = indent;
        }
        result += (column > indent ? " " : "") + word;
        column += word.size() + (column > indent);
    }
    return result + "\n";
}

/// A head and what it means, side by side where the head leaves room.
std::string entry(const std::string& head, const std::string& meaning)
{
    constexpr std::size_t INDENT = 26;
    const std::string line = "  " + head;
    return (line.size() + 2 > INDENT ? line + "\n" + std::string(INDENT, ' ')
                                     : line + std::string(INDENT - line.size(), ' ')) +
           wrapped(meaning, INDENT);
}

std::string paragraphs(const char* title, const std::string& text)
{
    std::string result = "\n" + std::string(title) + "\n";
    for (const std::string& line : lines_of(text))
        result += "  " + wrapped(line, 2);
    return result;
}

/// The verb with its arguments, form by form, beside what each does.
std::string forms(const Cli_Verb& verb)
{
    std::string text;
    const std::vector<std::string> arguments = lines_of(verb.arguments), summaries = lines_of(verb.summary);
    for (std::size_t i = 0; i < arguments.size(); ++i)
        text += entry(verb.name + (arguments[i].empty() ? "" : " " + arguments[i]), summaries[i]);
    return text;
}

std::string entry(const Cli_Option& option, const std::string& before)
{
    return entry(option.name + (option.value ? " " + std::string(option.value) : ""),
                 before + option.summary);
}

/// "ai, ain: " for an option that some verbs have.
std::string owners(const Cli_Option& option)
{
    std::string names;
    if (!option.is_common)
        for (const Cli_Verb& verb : cli_verbs())
            if (takes_option(verb, option))
                names += (names.empty() ? "" : ", ") + std::string(verb.name);
    return names.empty() ? "" : names + ": ";
}

} // namespace

std::string usage_line(const Cli_Verb& verb)
{
    std::string line = std::string("usage: kldrcim [options] ") + verb.name;
    const std::vector<std::string> arguments = lines_of(verb.arguments);
    for (std::size_t i = 0; i < arguments.size(); ++i)
        line += (i ? std::string(" | ") + verb.name : "") + (arguments[i].empty() ? "" : " " + arguments[i]);
    return line;
}

std::string program_help()
{
    std::string text =
        "Usage: kldrcim [options] VERB ARGUMENT...\n\n" +
        wrapped("Calls a CMPI provider module directly, as a CIM server would, without a CIM server. "
                "\"kldrcim VERB --help\" tells more of a verb.",
                0) +
        "\nVerbs\n";
    for (const Cli_Verb& verb : cli_verbs())
        text += forms(verb);
    text += "\nOptions\n";
    for (const Cli_Option& option : cli_options())
        text += entry(option, owners(option));
    std::string statuses = exit_status;
    for (const Cli_Verb& verb : cli_verbs())
        if (verb.statuses)
            statuses += "\n" + std::string(verb.name) + ": " + verb.statuses;
    return text + paragraphs("Paths and values", paths_and_values) +
           paragraphs("Parameters of rpc", parameters_of_rpc) + paragraphs("Exit status", statuses) +
           "\nExamples" + examples;
}

std::string verb_help(const Cli_Verb& verb)
{
    std::string text = wrapped(usage_line(verb).replace(0, 1, "U"), 0) + "\n" + forms(verb);
    std::string own, common;
    for (const Cli_Option& option : cli_options())
        if (takes_option(verb, option))
            own += entry(option, "");
        else if (option.is_common)
            common += entry(option, "");
    if (!own.empty())
        text += "\nOptions of " + std::string(verb.name) + "\n" + own;
    text += "\nOptions of every verb\n" + common;
    const std::string arguments = verb.arguments;
    if (arguments.find("PATH") != arguments.npos || arguments.find("VALUE") != arguments.npos)
        text += paragraphs("Paths and values", paths_and_values);
    if (std::string(verb.name) == "rpc")
        text += paragraphs("Parameters of rpc", parameters_of_rpc);
    return text +
           paragraphs("Exit status", exit_status + (verb.statuses ? "\n" + std::string(verb.statuses) : ""));
}

} // namespace KPRV::kldrcim
