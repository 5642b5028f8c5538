#include "kldrcim/verbs/Cli_Rpc.h"

#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/input/Text_File.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/walks/Agent.h"
#include "kldrcim/walks/Rpc_Methods.h"
#include "kldrcim/walks/Rpc_Text.h"

#include <algorithm>
#include <cstdio>
#include <fnmatch.h>

namespace KPRV::kldrcim {

namespace {

/// Stands between two calls of one command line.
constexpr const char* next_call = "+";

void put_line(const std::string& text)
{
    put(text);
    if (text.empty() || text.back() != '\n')
        put("\n");
}

std::vector<std::vector<std::string>> split_calls(const std::vector<std::string>& arguments)
{
    std::vector<std::vector<std::string>> calls(1);
    for (const std::string& argument : arguments)
        if (argument == next_call)
            calls.emplace_back();
        else
            calls.back().push_back(argument);
    return calls;
}

std::string parameters_text(const Rpc_Method& method)
{
    std::string text;
    for (const Rpc_Parameter& parameter : method.parameters)
        text += (text.empty() ? "" : " ") + parameter.name + ":" + rpc_type_name(parameter.type);
    return text;
}

std::string parameters_json(const Rpc_Method& method)
{
    std::vector<std::string> elements;
    for (const Rpc_Parameter& parameter : method.parameters)
        elements.push_back(json_object(
            {{"name", json_string(parameter.name)}, {"type", json_string(rpc_type_name(parameter.type))}},
            6));
    return json_array(elements, 4);
}

int list_methods(const Cli_Options& options)
{
    const std::string pattern = options.arguments.empty() ? "*" : options.arguments[0];
    std::vector<std::vector<std::string>> rows;
    std::vector<std::string> elements;
    for (const Rpc_Method& method : rpc_methods()) {
        if (fnmatch(pattern.c_str(), method.name.c_str(), FNM_CASEFOLD) != 0)
            continue;
        rows.push_back({method.name, parameters_text(method)});
        elements.push_back(
            json_object({{"method", json_string(method.name)}, {"parameters", parameters_json(method)}}, 2));
    }
    put_line(options.format == Cli_Options::Format::JSON ? json_array(elements)
                                                         : rows_as_table({"Method", "Parameters"}, rows));
    return 0;
}

int call_raw(Connection& connection, const std::string& text)
{
    std::string error;
    const auto request = text == "-" ? read_text_file(text, error) : text;
    if (!request)
        return complain("standard input: " + error, USAGE_ERROR);
    const Result answer = call_agent(connection, *request);
    if (!answer.ok())
        return complain(failure_text(answer), FAILURE);
    put_line(agent_reply(answer));
    return 0;
}

int call_one(Connection& connection, const std::string& request)
{
    const Result answer = call_agent(connection, request);
    if (!answer.ok())
        return complain(failure_text(answer), FAILURE);
    const Rpc_Reply reply = read_rpc_reply(agent_reply(answer));
    if (!reply.error.empty())
        return complain(reply.error, FAILURE);
    put_line(reply.result);
    return 0;
}

} // namespace

bool check_rpc(const Cli_Options& options, std::string& error)
{
    const std::size_t arguments = options.arguments.size();
    if (options.list_methods && options.raw)
        error = "--list and --raw make no sense together";
    else if (options.list_methods && arguments > 1)
        error = "usage: kldrcim [options] rpc --list [PATTERN]";
    else if (options.raw && arguments > 0)
        error = "usage: kldrcim [options] rpc --raw TEXT|-";
    else if (!options.list_methods && !options.raw && arguments == 0)
        error = "usage: kldrcim [options] rpc METHOD [PARAMETER...]";
    return error.empty();
}

int run_rpc(const Cli_Options& options, Connection& connection)
{
    if (options.list_methods)
        return list_methods(options);
    if (options.raw)
        return call_raw(connection, *options.raw);
    std::vector<std::string> requests;
    std::string error;
    for (const std::vector<std::string>& words : split_calls(options.arguments)) {
        if (words.empty())
            return complain(std::string("no method beside a \"") + next_call + "\"", USAGE_ERROR);
        const auto request = rpc_request(words[0], {words.begin() + 1, words.end()}, error);
        if (!request)
            return complain(error, USAGE_ERROR);
        requests.push_back(*request);
    }
    for (const std::string& request : requests)
        if (const int status = call_one(connection, request))
            return status;
    return 0;
}

} // namespace KPRV::kldrcim
