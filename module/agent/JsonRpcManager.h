#pragma once

#include "module/agent/Json_Tools.h"
#include "module/runtime/ground/String.h"

#include <json/value.h>

#include <algorithm>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace KPRV {

/// The agent's dispatcher: one request text in, one reply text out. It knows the methods by name and nothing
/// of CIM or of adapters.
class JsonRpcManager
{
public:
    /// A remote procedure. It takes the request's "params", whatever they are, and writes `result`, which is
    /// null before. It fails by throwing, or by leaving an object with a member "error" in `result`.
    using Handler = void (*)(const Json::Value& params, Json::Value& result);

    struct response
    {
        std::string text;
        /// 500 if the request was no JSON text, else 200, also for a reply that tells an error.
        sint32 status = 0;
    };

    /// The one dispatcher, with all methods. Made by the first call, gone when the module is unloaded.
    static JsonRpcManager* instance();

    /// Enters a method; the last one of a name stands.
    static void registerMethod(const std::string& name, Handler handler);
    void _registerMethod(const std::string& name, Handler handler);

    /// The names of all methods, in ascending order of their bytes.
    std::vector<std::string> getMethods() const;

    /// Answers a request: an object with "method", and "params", "id" and "version" as it likes. The reply is
    ///
    ///     {"result": ..., "version": "1.1", "id": ...}        "id" if the request has one, whatever it is
    ///     {"error": {"name": ..., "code": ..., "message": ...}, "version": "1.1", "id": ...}
    ///
    /// where an "error" that a method leaves in its result stands in the place of those three. A text that
    /// does not parse is answered by a plain text and status 500.
    ///
    /// A request that is neither an object nor null, and a "method" or "version" that is no text, are
    /// answered by nothing: they leave as a `std::exception`.
    void process(const std::string& request, response& out) const;
    /// The same; the text goes where a property takes it over without a copy. Returns the status.
    sint32 answer(std::string_view request, String& text) const;

private:
    JsonRpcManager() = default;

    /// Of the last letters: the names of the methods differ there.
    struct Hash
    {
        using is_transparent = void;
        size_t operator()(std::string_view name) const
        {
            uint64 letters = 0;
            const size_t count = std::min(name.size(), sizeof letters);
            std::copy_n(name.end() - static_cast<ptrdiff_t>(count), count, reinterpret_cast<char*>(&letters));
            return static_cast<size_t>((letters ^ name.size()) * 0x9E3779B97F4A7C15 >> 32);
        }
    };

    sint32 answer(std::string_view request, String& text, Json_Tools& tools) const;
    void call(std::string_view name, const Json::Value& params, Json::Value& reply) const;

    std::unordered_map<std::string, Handler, Hash, std::equal_to<>> _methods;
    mutable Kept_Json_Tools _tools;
};

} // namespace KPRV
