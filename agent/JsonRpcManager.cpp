#include "agent/JsonRpcManager.h"

#include "adapter/HbaAgentError.h"
#include "adapter/Json_Access.h"
#include "adapter/Json_Reading.h"
#include "agent/MethodRegistration.h"
#include "runtime/Mutex.h"

#include <json/writer.h>

#include <atomic>
#include <cxxabi.h>
#include <memory>

namespace KPRV {

constinit JsonRpcManager* JsonRpcManager::s_instance = nullptr;

namespace {

/// Set when all methods are entered.
constinit std::atomic<bool> complete = false;
constinit std::unique_ptr<JsonRpcManager> owner;

/// Makes the reply an error. What a method had written of its result goes.
void fail(Json::Value& reply, const char* name, int code, const std::string& message)
{
    reply.removeMember("result");
    Json::Value& error = reply["error"];
    error["name"] = name;
    error["code"] = code;
    error["message"] = message;
}

/// A failure that the adapter library told in its answer becomes the reply's own.
void lift_error(Json::Value& reply)
{
    if (!hasMember(reply["result"], "error"))
        return;
    Json::Value error = reply["result"]["error"];
    reply.removeMember("result");
    reply["error"].swap(error);
}

} // namespace

JsonRpcManager* JsonRpcManager::instance()
{
    if (complete.load(std::memory_order_acquire))
        return s_instance;
    // Entering the methods comes back here on the same thread, and finds the object that is being filled.
    static Mutex mutex(true);
    const Auto_Mutex lock(mutex);
    if (!s_instance) {
        owner.reset(new JsonRpcManager);
        s_instance = owner.get();
        MethodRegistration::registerMethods();
        complete.store(true, std::memory_order_release);
    }
    return s_instance;
}

void JsonRpcManager::registerMethod(const std::string& name, Handler handler)
{
    instance()->_registerMethod(name, handler);
}

void JsonRpcManager::_registerMethod(const std::string& name, Handler handler)
{
    _methods[name] = handler;
}

std::vector<std::string> JsonRpcManager::getMethods() const
{
    std::vector<std::string> names;
    for (const auto& [name, handler] : _methods)
        names.push_back(name);
    return names;
}

void JsonRpcManager::process(const std::string& request, response& out) const
{
    Json::Value parsed;
    std::string errors;
    if (!read_json(request, parsed, errors)) {
        out.status = 500;
        out.text = "There was an error parsing the JSON text comprising the Procedure Call:\n" + errors;
        return;
    }
    const Json::Value& root = parsed;
    Json::Value reply;
    // Clients of all versions are served alike, but a version must be a text.
    if (root.isMember("version"))
        asString(root["version"]);
    if (root.isMember("id"))
        reply["id"] = root["id"];
    reply["version"] = "1.1";
    call(asString(root["method"]), root["params"], reply);

    out.status = 200;
    out.text = Json::StyledWriter().write(reply);
}

void JsonRpcManager::call(const std::string& name, const Json::Value& params, Json::Value& reply) const
{
    const auto method = _methods.find(name);
    if (method == _methods.end())
        return fail(reply, "JSONRPCError", 105, "Procedure not found");
    try {
        method->second(params, reply["result"]);
        lift_error(reply);
    } catch (const HbaAgentError& error) {
        fail(reply, "USERDEFINEDError", error.code, error.message);
    } catch (const std::exception& error) {
        fail(reply, "JSONRPCError", 200, error.what());
    } catch (...) {
        // Without a type it is no exception of C++: the thread is being cancelled, which nothing may stop.
        if (!abi::__cxa_current_exception_type())
            throw;
        fail(reply, "UnCaughtError", 5000, "Unknown error that was not caught");
    }
}

} // namespace KPRV
