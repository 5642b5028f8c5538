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
void lift_error(Json::Value& reply, const Json::Value& result)
{
    if (!hasMember(result, "error"))
        return;
    Json::Value error = result["error"];
    reply.removeMember("result");
    reply["error"].swap(error);
}

/// A member of the request; null if it is absent. Throws in the JSON library's words if the request is
/// neither an object nor null.
const Json::Value* find(const Json::Value& root, std::string_view name)
{
    return root.find(name.data(), name.data() + name.size());
}

const Json::Value& value_of(const Json::Value* found)
{
    return found ? *found : Json::Value::nullSingleton();
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
        try {
            MethodRegistration::registerMethods();
        } catch (...) {
            // The next call begins anew: a dispatcher that lacks methods would lack them for good.
            s_instance = nullptr;
            owner.reset();
            throw;
        }
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
    String text;
    out.status = answer(request, text);
    out.text = text.c_str();
}

sint32 JsonRpcManager::answer(std::string_view request, String& text) const
{
    Json::Value parsed;
    std::string errors;
    if (!read_json(request, parsed, errors)) {
        text = String("There was an error parsing the JSON text comprising the Procedure Call:\n",
                      errors.c_str());
        return 500;
    }
    const Json::Value& root = parsed;
    Json::Value reply;
    // Clients of all versions are served alike, but a version must be a text.
    if (const Json::Value* const version = find(root, "version"))
        asView(*version);
    if (const Json::Value* const id = find(root, "id"))
        reply["id"] = *id;
    reply["version"] = "1.1";
    call(asView(value_of(find(root, "method"))), value_of(find(root, "params")), reply);

    // The text is copied while the values stand: once they are gone, the allocator sorts what they leave
    // before it finds room for a long text, and that takes longer than the copy.
    const std::string written = Json::StyledWriter().write(reply);
    text = String(written.data(), static_cast<uint32>(written.size()));
    return 200;
}

void JsonRpcManager::call(std::string_view name, const Json::Value& params, Json::Value& reply) const
{
    const auto method = _methods.find(name);
    if (method == _methods.end())
        return fail(reply, "JSONRPCError", 105, "Procedure not found");
    try {
        Json::Value& result = reply["result"];
        method->second(params, result);
        lift_error(reply, result);
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
