#pragma once

#include "module/runtime/ground/String.h"

#include <json/reader.h>
#include <json/writer.h>

#include <atomic>
#include <optional>
#include <string_view>

namespace KPRV {

/// What reading a request and writing a reply takes.
struct Json_Tools
{
    Json::Reader reader;
    Json::StyledWriter writer;
    /// The text of the last reply: the next one is written over it if nobody holds it any more.
    String reply;

    /// A text that the writer wrote becomes the reply. One for which there is no room throws
    /// `std::bad_alloc`.
    const String& keep(std::string_view written)
    {
        reply.assign(written.data(), written.size());
        return reply;
    }
};

/// Tools kept from one request to the next, since to make them costs as much as a short text costs to read.
/// They hold on to memory in proportion to the texts that they have seen: after a long one they go.
class Kept_Json_Tools
{
public:
    Kept_Json_Tools() = default;
    /// A copy has none yet.
    Kept_Json_Tools(const Kept_Json_Tools&) {}

    /// Calls `use` with the tools and returns what it returns. Where somebody has them already, another
    /// thread or a method that sends a request of its own, and for a request of that many characters if they
    /// are too many, the tools are fresh ones.
    template <class Use>
    auto lend(size_t request, Use use)
    {
        if (request > LONG || _lent.test_and_set(std::memory_order_acquire)) {
            Json_Tools fresh;
            return use(fresh);
        }
        const Return back{*this};
        if (!_tools)
            _tools.emplace();
        return use(*_tools);
    }

private:
    static constexpr size_t LONG = 4096;

    struct Return
    {
        Kept_Json_Tools& tools;

        ~Return()
        {
            if (tools._tools && tools._tools->reply.capacity() > LONG)
                tools._tools.reset();
            tools._lent.clear(std::memory_order_release);
        }
    };

    std::optional<Json_Tools> _tools;
    std::atomic_flag _lent;
};

} // namespace KPRV
