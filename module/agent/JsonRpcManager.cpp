#include "module/agent/JsonRpcManager.h"

#include "contracts/adapter/HbaAgentError.h"
#include "module/adapter/Json_Access.h"
#include "module/adapter/Json_Reading.h"
#include "module/agent/MethodRegistration.h"
#include "module/runtime/system/Standard_Mutex.h"
#include "module/runtime/system/forced_unwinding.h"

#include <algorithm>
#include <atomic>
#include <exception>
#include <memory>

namespace KPRV {

namespace {

/// Recursive: entering the methods comes back on the same thread, and finds the object that is being filled.
constinit Standard_Mutex<std::recursive_mutex> owner_mutex;
constinit std::unique_ptr<JsonRpcManager> owner GUARDED_BY(owner_mutex);
/// The same, for all to see, when all methods are entered.
constinit std::atomic<JsonRpcManager*> complete = nullptr;

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

/// What is read of a request.
enum Place
{
    ID,
    METHOD,
    PARAMS,
    VERSION,
};
constexpr Members<4>::Names PLACES = {"id", "method", "params", "version"};

/// What every reply has, which need not be copied into each.
const Json::StaticString ID_NAME("id"), RESULT_NAME("result"), VERSION_NAME("version"), OUR_VERSION("1.1");

/// Throws in the JSON library's words if the request is neither an object nor null.
void check_kind(const Json::Value& root)
{
    if (!root.isObject())
        root.find(PLACES[VERSION].begin(), PLACES[VERSION].end());
}

} // namespace

JsonRpcManager* JsonRpcManager::instance()
{
    if (JsonRpcManager* const manager = complete.load(std::memory_order_acquire))
        return manager;
    const Auto_Lock lock(owner_mutex);
    if (!owner) {
        owner.reset(new JsonRpcManager);
        try {
            MethodRegistration::registerMethods();
        } catch (...) {
            // The next call begins anew: a dispatcher that lacks methods would lack them for good.
            owner.reset();
            throw;
        }
        complete.store(owner.get(), std::memory_order_release);
    }
    return owner.get();
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
    names.reserve(_methods.size());
    for (const auto& [name, handler] : _methods)
        names.push_back(name);
    std::ranges::sort(names);
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
    return _tools.lend(request.size(), [&](Json_Tools& tools) { return answer(request, text, tools); });
}

sint32 JsonRpcManager::answer(std::string_view request, String& text, Json_Tools& tools) const
{
    Json::Value parsed;
    std::string errors;
    if (!read_json(tools.reader, request, parsed, errors)) {
        text = String("There was an error parsing the JSON text comprising the Procedure Call:\n",
                      errors.c_str());
        return 500;
    }
    check_kind(parsed);
    const Members<4> told(parsed, PLACES);
    Json::Value reply;
    // Clients of all versions are served alike, but a version must be a text.
    asView(told[VERSION]);
    if (told.has(ID))
        reply[ID_NAME] = told[ID];
    reply[VERSION_NAME] = OUR_VERSION;
    call(asView(told[METHOD]), told[PARAMS], reply);

    // The text is copied while the values stand: once they are gone, the allocator sorts what they leave
    // before it finds room for a long text, and that takes longer than the copy.
    const std::string written = tools.writer.write(reply);
    text = tools.keep(written);
    return 200;
}

void JsonRpcManager::call(std::string_view name, const Json::Value& params, Json::Value& reply) const
{
    const auto method = _methods.find(name);
    if (method == _methods.end())
        return fail(reply, "JSONRPCError", 105, "Procedure not found");
    try {
        Json::Value& result = reply[RESULT_NAME];
        method->second(params, result);
        lift_error(reply, result);
    } catch (const HbaAgentError& error) {
        fail(reply, "USERDEFINEDError", error.code, error.message);
    } catch (const std::exception& error) {
        fail(reply, "JSONRPCError", 200, error.what());
    } catch (...) {
        rethrow_forced_unwinding();
        fail(reply, "UnCaughtError", 5000, "Unknown error that was not caught");
    }
}

} // namespace KPRV
