#pragma once

#include <memory>

namespace KPRV {

/// The time in which one client waits for its answer, on the thread that works for it. Requests that the
/// server makes on the same thread meanwhile, for that answer, are part of it. What may not change within one
/// answer is asked for once and kept here.
class Request_Scope
{
public:
    Request_Scope();
    ~Request_Scope();
    Request_Scope(const Request_Scope&) = delete;
    Request_Scope& operator=(const Request_Scope&) = delete;

    /// That of the calling thread; null outside of requests.
    static Request_Scope* current();

    struct Note
    {
        virtual ~Note() = default;
    };
    /// What was asked of the host.
    std::unique_ptr<Note> host;

private:
    const bool _outermost;
};

} // namespace KPRV
