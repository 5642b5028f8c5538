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
    held_ = core.blocks.take_bytes(bytes.size() + 1);
    std::memcpy(held_, bytes.data(), bytes.size());
    held_[bytes.size()] = '\0';
    held_size_ = static_cast<std::uint32_t>(bytes.size());
}

std::string_view Object::held() const
{
    if (held_)
        core.blocks.touch_bytes(held_, std::size_t(held_size_) + 1);
    return {held_, held_size_};
}

void Object::let_go()
{
    if (held_)
        core.blocks.give_bytes(held_, std::size_t(held_size_) + 1);
    held_ = nullptr;
    held_size_ = 0;
}

Core::~Core()
{
    while (Object* const object = blocks.any())
        destroy(*object);
}

void Core::destroy(Object& object)
{
    Object_Blocks::find(object.address());
    object.~Object();
    blocks.give_object(&object);
}

void Core::adopt(Object& object)
{
    if (object.owner != Owner::HOST)
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
    Object* last = nullptr;
    {
        const Auto_Lock lock(mutex_);
        retired_.push_back(&object);
        if (retired_.size() <= options.most_shells)
            return;
        last = retired_.front();
        retired_.pop_front();
    }
    destroy(*last);
}

void Core::pack(Object& object)
{
    const Auto_Lock lock(mutex_);
    try {
        object.packed = object.pack();
    } catch (const std::bad_alloc&) {
        // It stays as it was.
    }
}

void Core::unpack(Object& object)
{
    const Auto_Lock lock(mutex_);
    if (!object.packed)
        return;
    object.unpack();
    object.packed = false;
}

} // namespace KPRV::broker
