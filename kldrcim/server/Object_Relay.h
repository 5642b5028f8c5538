#pragma once

#include "broker/values/Receiver.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <condition_variable>
#include <exception>
#include <functional>
#include <thread>
#include <variant>
#include <vector>

namespace KPRV::kldrcim {

using namespace broker;

/// Hands objects on to a function that runs on a thread of its own meanwhile, one after the other. For the
/// first few there is no such thread: most answers are short.
///
/// How it works. There are three lists: one is filled, one waits, and one is worked on. A full one changes
/// places with the one that waits, once that has been taken. What has been worked on comes back in this way,
/// to be freed by the thread that made it: the heap would otherwise be what the two threads wait for.
class Object_Relay
{
public:
    using Object = std::variant<Instance_Value, Path_Value>;
    /// False if nobody wants another one.
    using Function = std::function<bool(Object& object)>;

    explicit Object_Relay(Function function) : _function(std::move(function)) {}
    ~Object_Relay();
    Object_Relay(const Object_Relay&) = delete;
    Object_Relay& operator=(const Object_Relay&) = delete;

    /// False if nobody wants another one.
    bool put(Object&& object);
    /// Waits until the function has had all. Throws what has left the function.
    void finish();

private:
    using Batch = std::vector<Object>;

    bool hand_over();
    void end();
    void run();
    void work();

    const Function _function;
    std::size_t _count = 0;
    bool _is_alone = false;
    Batch _filled;
    Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    Batch _waiting GUARDED_BY(_mutex);
    bool _is_waiting GUARDED_BY(_mutex) = false;
    bool _no_more GUARDED_BY(_mutex) = false;
    bool _refused GUARDED_BY(_mutex) = false;
    std::exception_ptr _failure GUARDED_BY(_mutex);
    std::thread _thread;
};

} // namespace KPRV::kldrcim
