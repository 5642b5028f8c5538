#pragma once

#include "kldrcim/server/Pull_Context.h"

#include <map>
#include <memory>
#include <vector>

namespace KPRV::kldrcim {

/// The open enumerations of all clients. A context is taken out while it is used, so that nobody else has it
/// meanwhile, and one that nobody has asked for in its lifetime is gone.
class Pull_Contexts
{
public:
    using Clock = std::chrono::steady_clock;

    static constexpr std::size_t MOST = 20;
    static constexpr std::chrono::seconds usual_lifetime{30};
    static constexpr std::chrono::seconds longest_lifetime{90};

    /// The name under which it comes back; empty if there are too many.
    std::string put(std::unique_ptr<Pull_Context> context, Clock::time_point now = Clock::now());
    /// Back under its own name.
    void put_back(const std::string& name, std::unique_ptr<Pull_Context> context,
                  Clock::time_point now = Clock::now());
    /// Null for one that there is not.
    std::unique_ptr<Pull_Context> take(const std::string& name, Clock::time_point now = Clock::now());

    /// Drops those whose lifetime is over; to be called now and then, for clients that never come back.
    void sweep(Clock::time_point now = Clock::now());

    std::size_t count() const;

private:
    struct Kept
    {
        std::unique_ptr<Pull_Context> context;
        Clock::time_point end;
    };

    /// Takes those out whose lifetime is over: their end may have to wait for a provider.
    std::vector<Kept> take_old(Clock::time_point now) REQUIRES(_mutex);

    mutable Standard_Mutex<> _mutex;
    std::map<std::string, Kept> _kept GUARDED_BY(_mutex);
};

} // namespace KPRV::kldrcim
