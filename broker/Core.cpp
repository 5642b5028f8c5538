#include "broker/Core.h"

#include <cstring>

namespace KPRV::broker {

Object* find_object(const void* address)
{
    Object* const object = address ? Object_Blocks::find(address) : nullptr;
    if (object && object->packed)
        object->core.unpack(*object);
    return object;
}

void Object::hold(std::string_view bytes)
{
    let_go();
    _held = core.blocks.take_bytes(bytes.size() + 1);
    std::memcpy(_held, bytes.data(), bytes.size());
    _held[bytes.size()] = '\0';
    _held_size = static_cast<std::uint32_t>(bytes.size());
}

std::string_view Object::held() const
{
    if (_held)
        core.blocks.touch_bytes(_held, std::size_t(_held_size) + 1);
    return {_held, _held_size};
}

void Object::let_go()
{
    if (_held)
        core.blocks.give_bytes(_held, std::size_t(_held_size) + 1);
    _held = nullptr;
    _held_size = 0;
}

Core::~Core()
{
    while (Object* const object = blocks.any())
        blocks.end(*object);
}

void Core::adopt(Object& object)
{
    if (object.owner != Owner::SERVER)
        ledger.made(object.kind, object.maker);
    blocks.announce(&object);
}

void Core::retire(Object& object)
{
    // Brings its block in, and makes another one leave: all that a call has left goes this way.
    Object_Blocks::find(object.address());
    if (!object.live.exchange(false))
        return;
    object.packed = false;
    object.drop();
    Object* last = &object;
    try {
        const Auto_Lock lock(_mutex);
        _retired.push_back(&object);
        if (_retired.size() <= options.most_shells)
            return;
        last = _retired.front();
        _retired.pop_front();
    } catch (const std::bad_alloc&) {
        // Its shell is what can be spared.
    }
    blocks.end(*last);
}

void Core::pack(Object& object)
{
    const Auto_Lock lock(_mutex);
    try {
        object.packed = object.pack();
    } catch (const std::bad_alloc&) {
        // It stays as it was.
    }
}

void Core::unpack(Object& object)
{
    const Auto_Lock lock(_mutex);
    if (!object.packed)
        return;
    object.unpack();
    object.packed = false;
}

} // namespace KPRV::broker
