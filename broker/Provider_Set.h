#pragma once

#include "broker/Broker.h"
#include "broker/Module.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <map>

namespace KPRV::broker {

/// The management interfaces that the module's factories have handed out. Each is made when it is first
/// needed, by one thread at a time, and kept until its cleanup.
class Provider_Set
{
public:
    Provider_Set(const Module& module, Broker& broker) : _module(module), _broker(broker) {}

    /// The interface of that class and kind. Null if the module has no such factory, or if the factory
    /// failed: `answer` then has its status.
    CMPIInstanceMI* instance(const std::string& class_name, Result& answer);
    CMPIAssociationMI* association(const std::string& class_name, Result& answer);
    CMPIMethodMI* method(const std::string& class_name, Result& answer);
    CMPIIndicationMI* indication(const std::string& class_name, Result& answer);

    bool serves(const std::string& class_name, Mi_Kind kind) const
    {
        return _module.factory(class_name, kind);
    }

    /// Calls `cleanup` of all interfaces (or of one class's), kind by kind in the order instance,
    /// association, method, indication. One that answers 50 or 51 is kept; the highest code is returned.
    CMPIrc cleanup(bool terminating);
    CMPIrc cleanup(const std::string& class_name, bool terminating);

    /// Interfaces that are in use.
    std::size_t count() const;

private:
    using Key = std::pair<std::string, Mi_Kind>;

    /// Calls the factory unless that has been done; interfaces of all kinds are two pointers.
    void* get(const std::string& class_name, Mi_Kind kind, Result& answer);
    void* make(const std::string& class_name, Mi_Kind kind, Result& answer);
    CMPIrc cleanup_one(void* mi, Mi_Kind kind, bool terminating);
    template <class Wanted>
    CMPIrc cleanup_if(Wanted wanted, bool terminating);

    const Module& _module;
    Broker& _broker;
    mutable Standard_Mutex<std::recursive_mutex> _mutex;
    std::map<Key, void*> _made GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
