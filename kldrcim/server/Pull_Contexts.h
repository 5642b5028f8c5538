#pragma once

#include "broker/values/Request.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <chrono>
#include <deque>
#include <map>
#include <memory>

namespace KPRV::kldrcim {

using namespace broker;

/// What an opened enumeration has still to give.
struct Pull_Context
{
    enum Kind
    {
        INSTANCES,
        PATHS,
        /// Instances without paths: what a query selects.
        ROWS,
    };

    Kind kind = INSTANCES;
    std::string name_space;
    std::deque<Instance_Value> instances;
    std::deque<Path_Value> paths;
    bool with_origins = false;
    Property_List properties;
    /// A class that the instances are shown as; empty for their own.
    std::string seen_as;
    /// Between two pulls.
    std::chrono::seconds lifetime{0};

    std::size_t size() const { return instances.size() + paths.size(); }
};

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

    std::size_t count() const;

private:
    struct Kept
    {
        std::unique_ptr<Pull_Context> context;
        Clock::time_point end;
    };

    void sweep(Clock::time_point now) REQUIRES(_mutex);

    mutable Standard_Mutex<> _mutex;
    std::map<std::string, Kept> _kept GUARDED_BY(_mutex);
};

} // namespace KPRV::kldrcim
