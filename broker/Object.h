#pragma once

#include "broker/Object_Kind.h"
#include "contracts/cmpi/cmpift.h"

#include <atomic>
#include <cstdint>
#include <memory>
#include <string_view>

namespace KPRV::broker {

class Core;
class Frame_Objects;

/// Who has to end an object's life.
enum class Owner : std::uint8_t
{
    /// The call frame of the thread that made it, unless the provider releases it first.
    FRAME,
    /// The provider: clones.
    PROVIDER,
    /// The host: arguments of a call. A provider must not release them.
    SERVER,
    /// The attachment of a thread: contexts from `CBPrepareAttachThread`, which `CBDetachThread` ends.
    THREAD,
};

/// The server's side of a CMPI object.
struct Object
{
    Object(Core& object_core, Object_Kind object_kind) : core(object_core), kind(object_kind) {}
    virtual ~Object() { let_go(); }
    Object(const Object&) = delete;
    Object& operator=(const Object&) = delete;

    /// Frees what the object holds; the shell stays.
    virtual void drop() { let_go(); }
    /// The address that the provider sees.
    virtual const void* address() const = 0;

    /// Holds what the object is about as bytes until `unpack`, which is called before anybody looks at it.
    /// False for kinds that would gain nothing, and stay as they are.
    virtual bool pack() { return false; }
    virtual void unpack() {}

    /// Keeps a copy of these bytes among the blocks, with a zero behind them, instead of those before.
    void hold(std::string_view bytes);
    void let_go();
    bool holds() const { return _held != nullptr; }
    /// Its text is null if nothing is held.
    std::string_view held() const;

    Core& core;
    /// The call that made it.
    const char* maker = "";
    Frame_Objects* frame = nullptr;
    /// Those that the frame recorded before and after it.
    Object* before = nullptr;
    Object* after = nullptr;

private:
    char* _held = nullptr;
    std::uint32_t _held_size = 0;

public:
    const Object_Kind kind;
    Owner owner = Owner::FRAME;
    std::atomic<bool> live = true;
    std::atomic<bool> packed = false;
    /// The frame has had a look whether it should be packed.
    bool is_old = false;
};

/// Joins a CMPI struct (the part that providers see) with the server side.
template <class Cmpi_Type, Object_Kind Kind>
struct Object_Of : Cmpi_Type, Object
{
    using Cmpi = Cmpi_Type;
    static constexpr Object_Kind KIND = Kind;

    template <class Table>
    Object_Of(Core& object_core, const Table& table) : Object(object_core, Kind)
    {
        static_assert(alignof(Cmpi_Type) <= alignof(Object), "it stands right behind the host's part");
        this->hdl = static_cast<Object*>(this);
        this->ft = &table;
    }
    const void* address() const override { return static_cast<const Cmpi_Type*>(this); }
    Cmpi_Type* cmpi() { return this; }
};

/// The object of a server that stands at this address, released ones included; null for any other address,
/// which is not read. What it holds is unpacked. Safe for any thread.
Object* find_object(const void* address);

} // namespace KPRV::broker
