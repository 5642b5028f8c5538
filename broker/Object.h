#pragma once

#include "broker/Object_Kind.h"
#include "contracts/cmpi/cmpift.h"

#include <atomic>
#include <memory>
#include <unordered_map>

namespace KPRV::broker {

class Call_Frame;
class Core;

/// Who has to end an object's life.
enum class Owner
{
    /// The call frame of the thread that made it, unless the provider releases it first.
    FRAME,
    /// The provider: clones.
    PROVIDER,
    /// The host: arguments of a call. A provider must not release them.
    HOST,
    /// The attachment of a thread: contexts from `CBPrepareAttachThread`, which `CBDetachThread` ends.
    THREAD,
};

/// Host side of a CMPI object.
struct Object
{
    Object(Core& object_core, Object_Kind object_kind) : core(object_core), kind(object_kind) {}
    virtual ~Object() = default;
    Object(const Object&) = delete;
    Object& operator=(const Object&) = delete;

    /// Frees what the object holds; the shell stays.
    virtual void drop() = 0;
    /// The address that the provider sees.
    virtual const void* address() const = 0;

    Core& core;
    const Object_Kind kind;
    /// The call that made it.
    const char* maker = "";
    Owner owner = Owner::FRAME;
    Call_Frame* frame = nullptr;
    std::atomic<bool> live = true;
};

/// Joins a CMPI struct (the part that providers see) with the host side.
template <class Cmpi_Type, Object_Kind Kind>
struct Object_Of : Cmpi_Type, Object
{
    using Cmpi = Cmpi_Type;
    static constexpr Object_Kind KIND = Kind;

    template <class Table>
    Object_Of(Core& object_core, const Table& table) : Object(object_core, Kind)
    {
        this->hdl = static_cast<Object*>(this);
        this->ft = &table;
    }
    const void* address() const override { return static_cast<const Cmpi_Type*>(this); }
    Cmpi_Type* cmpi() { return this; }
};

/// The object of a host that stands at this address, released ones included; null for any other address,
/// which is not read. Safe for any thread.
Object* find_object(const void* address);

} // namespace KPRV::broker
