#pragma once

#include "broker/values/Plain_Value.h"

namespace KPRV::broker {

/// Takes the results of a request one by one, in the order and on the thread in which they come. What it is
/// given is its own; nobody else keeps it.
class Receiver
{
public:
    virtual ~Receiver() = default;

    /// False for enough: nothing more is handed over, and no further provider is asked. What they throw ends
    /// the request likewise and comes out of the call that sent it.
    virtual bool instance(Instance_Value&& instance) = 0;
    virtual bool path(Path_Value&& path) = 0;
};

/// Keeps all that comes.
struct Collected final : Receiver
{
    bool instance(Instance_Value&& instance) override
    {
        instances.push_back(std::move(instance));
        return true;
    }
    bool path(Path_Value&& path) override
    {
        paths.push_back(std::move(path));
        return true;
    }

    std::vector<Instance_Value> instances;
    std::vector<Path_Value> paths;
};

} // namespace KPRV::broker
