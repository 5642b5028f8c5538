#include "module/agent/ProviderDiscoveryMethods.h"

#include "module/agent/JsonRpcManager.h"
#include "module/agent/Method.h"
#include "module/agent/Method_Shapes.h"
#include "module/runtime/system/log.h"

namespace KPRV {

// A handler is its row, made a function.
#define NONE
#define S(key) {Method_Member::STRING, #key, nullptr},
#define I(key) {Method_Member::INTEGER, #key, nullptr},
#define B(key) {Method_Member::BOOLEAN, #key, nullptr},
#define A(key) {Method_Member::ARRAY, #key, nullptr},
#define O(key) {Method_Member::OBJECT, #key, nullptr},
#define ADDRESS(key) {Method_Member::ADDRESS, #key, nullptr},
#define OWN_S(name) {Method_Member::OWN, #name, nullptr},
#define OWN_A(name) {Method_Member::OWN, #name, nullptr},
#define OWN_O(name) {Method_Member::OWN, #name, nullptr},
#define UNREAD(name) {Method_Member::UNREAD, #name, nullptr},
#define ZERO(key) {Method_Member::ZERO, #key, nullptr},
#define FUNCTION(text) {Method_Member::TEXT, "function", #text},
#define METHOD(wire, ...) HANDLER(__VA_ARGS__)
#define HANDLER(handler, shape, entry, ...)                                                                  \
    void ProviderDiscoveryMethods::handler(const Json::Value& params, Json::Value& result)                   \
    {                                                                                                        \
        static constexpr Method method = {#handler, &Method_Shapes::shape, entry_of(entry), {__VA_ARGS__}};  \
        call(method, params, result);                                                                        \
    }
#include "contracts/agent/Methods.def"

void ProviderDiscoveryMethods::registerMethods(JsonRpcManager& manager)
{
    LOG(DBG, "Entering: %s", "registerMethods");
#define METHOD(wire, handler, ...) manager.registerMethod(wire, &ProviderDiscoveryMethods::handler);
#define HANDLER(...)
#include "contracts/agent/Methods.def"
}

} // namespace KPRV
