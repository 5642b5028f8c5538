#include "simulator/Answers.h"

#include "simulator/Behaviours.h"
#include "simulator/Entry_Points.h"

#include <algorithm>
#include <sstream>

namespace KPRV::simulator {

namespace {

// The request members that name an adapter or a port.
constexpr const char* address_members[] = {"indexStr", "wwn",    "mac",      "pwwn",     "pPortWwn",
                                           "portWwn",  "hbaWwn", "lPortWwn", "rPortWwn", "Node"};

bool is_address_member(const std::string& name)
{
    return std::find(std::begin(address_members), std::end(address_members), name) !=
           std::end(address_members);
}

// Which of "a|b" the request has; empty if it has neither.
std::string present_member(const Json::Value& request, const std::string& choice)
{
    if (!request.isObject())
        return "";
    std::istringstream names(choice);
    for (std::string name; std::getline(names, name, '|');)
        if (request.isMember(name))
            return name;
    return "";
}

// The text of the address that the call is about; empty if it is about the host.
std::string call_address(const Entry_Row& row, const Json::Value& request)
{
    const std::string choices = row.request;
    const std::string name = present_member(request, choices.substr(0, choices.find(' ')));
    return is_address_member(name) ? request[name].asString() : "";
}

// What the author of the inventory wants answered: the port's, the adapter's, then the host's.
const Json::Value* authors_answer(Inventory& inventory, const Entry_Row& row, const std::string& address)
{
    const Inventory::Place port = inventory.port_at(address);
    const Inventory::Place place = port ? port : inventory.adapter_at(address);
    if (place.port && place.port->answers.isMember(row.symbol))
        return &place.port->answers[row.symbol];
    if (place && place.adapter->answers.isMember(row.symbol))
        return &place.adapter->answers[row.symbol];
    if (inventory.answers.isMember(row.symbol))
        return &inventory.answers[row.symbol];
    return nullptr;
}

} // namespace

std::string missing_member(const std::string& asked, const Json::Value& request)
{
    std::istringstream choices(asked);
    for (std::string choice; choices >> choice;) {
        const std::string name = present_member(request, choice);
        if (name.empty() || (is_address_member(name) && !request[name].isString()))
            return choice;
    }
    return "";
}

Json::Value error_answer(int code, const std::string& message)
{
    Json::Value answer;
    answer["error"]["name"] = "LibraryError";
    answer["error"]["code"] = code;
    answer["error"]["message"] = message;
    return answer;
}

Json::Value error_answer(Error_Code code, const std::string& message)
{
    return error_answer(static_cast<int>(code), message);
}

Json::Value done_answer()
{
    Json::Value answer;
    answer["status"] = 0;
    return answer;
}

Json::Value answer_by_row(State& state, const Entry_Row& row, const Json::Value& request)
{
    const std::string name = row.symbol;
    const std::string missing = missing_member(row.request, request);
    if (!missing.empty())
        return error_answer(Error_Code::REQUEST, name + ": the request must have " + missing);
    const std::string address = call_address(row, request);
    if (const Json::Value* answer = authors_answer(state.inventory, row, address))
        return *answer;
    if (row.behaviour != unsupported)
        return row.behaviour(state, request);
    return error_answer(Error_Code::UNSUPPORTED, name + ": not supported");
}

} // namespace KPRV::simulator
