#include "kldrcim/verbs/Cli_Rpc.h"

#include "kldrcim/formats/Format_Json.h"
#include "kldrcim/formats/Format_Table.h"
#include "kldrcim/formats/Output.h"
#include "kldrcim/formats/Rpc_Text.h"
#include "kldrcim/verbs/Cli_Complaints.h"
#include "kldrcim/walks/Rpc_Methods.h"

#include <algorithm>
#include <cstdio>
#include <fnmatch.h>

namespace KPRV::kldrcim {

namespace {

/// The one instance of the agent's class.
constexpr const char* agent_class = "KALDERA_AgentService";
constexpr const char* agent_name = "Kaldera Agent Service Provider";

/// Stands between two calls of one command line.
constexpr const char* next_call = "+";

void put_line(const std::string& text)
{
    put(text);
    if (text.empty() || text.back() != '\n')
        put("\n");
}

std::string read_all(std::FILE* file)
{
    std::string text;
    char buffer[4096];
    while (const std::size_t size = std::fread(buffer, 1, sizeof buffer, file))
        text.append(buffer, size);
    return text;
}

/// The method that carries the protocol.
class Agent
{
public:
    explicit Agent(Connection& connection) : connection_(connection) {}

    /// False with a one-line `error` if the provider answers a failure or no reply.
    bool call(const std::string& request, std::string& reply, std::string& error)
    {
        Path_Value path;
        path.class_name = agent_class;
        path.keys = {{"Name", Value::text(agent_name)}};
        const Result result =
            connection_.invoke_method(path, "executeMethod", {{"request", Value::text(request)}});
        const Value* response = find_value(result.out, "response");
        if (!result.ok() || !response) {
            error = result.ok() ? "executeMethod gave no response" : failure_text(result);
            return false;
        }
        reply = response->as_text();
        return true;
    }

private:
    Connection& connection_;
};

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

int call_raw(Agent& agent, const std::string& text)
{
    std::string reply;
    std::string error;
    if (!agent.call(text == "-" ? read_all(stdin) : text, reply, error))
        return complain(error, 1);
    put_line(reply);
    return 0;
}

int call_one(Agent& agent, const std::string& request)
{
    std::string text;
    std::string error;
    if (!agent.call(request, text, error))
        return complain(error, 1);
    const Rpc_Reply reply = read_rpc_reply(text);
    if (!reply.error.empty())
        return complain(reply.error, 1);
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
    Agent agent(connection);
    if (options.raw)
        return call_raw(agent, *options.raw);
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
        if (const int status = call_one(agent, request))
            return status;
    return 0;
}

} // namespace KPRV::kldrcim
