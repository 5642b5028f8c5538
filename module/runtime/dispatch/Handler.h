#pragma once

#include "module/runtime/objects/Wanted.h"

namespace KPRV {

/// Receives what a provider returns; it owns the instance. A null instance is the end mark. Providers do not
/// look at the result.
using Instance_Handler_Proc = bool (*)(Instance* instance, int status, void* client_data);
using Indication_Handler_Proc = bool (*)(Instance* indication, void* client_data);

/// Typed face of the callback through which a provider streams its results, one at a time.
template <class T>
class Instance_Handler
{
public:
    /// `wanted` null: everything.
    Instance_Handler(Instance_Handler_Proc proc, void* client_data, const Wanted* wanted = nullptr)
        : _proc(proc), _client_data(client_data), _wanted(wanted ? *wanted : Wanted())
    {
    }
    /// What the receiver does with: it takes more, and sorts it out.
    const Wanted& wanted() const { return _wanted; }
    /// Takes over the instance. The ends of an association may be ends of others too, and from then on nobody
    /// writes to them: what they became for the server is used again.
    bool handle(T* instance) { return _proc(instance, 0, _client_data); }

private:
    Instance_Handler_Proc _proc;
    void* _client_data;
    Wanted _wanted;
};

template <class T>
using Enum_Instances_Handler = Instance_Handler<T>;
template <class T>
using Enum_References_Handler = Instance_Handler<T>;
template <class T>
using Enum_Associator_Names_Handler = Instance_Handler<T>;
template <class T>
using Enum_Associators_Handler = Instance_Handler<T>;

/// Carries alerts of one subscription stretch to the server. The provider owns it from `enable_indications`
/// on and deletes it after `disable_indications`.
template <class T>
class Indication_Handler
{
public:
    Indication_Handler(Indication_Handler_Proc proc, void* client_data)
        : _proc(proc), _client_data(client_data)
    {
    }
    /// Takes over the indication; null is the end mark.
    bool handle(T* indication) { return _proc(indication, _client_data); }

private:
    Indication_Handler_Proc _proc;
    void* _client_data;
};

} // namespace KPRV
