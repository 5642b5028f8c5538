#include "broker/Core.h"

#include "broker/Call_Frame.h"

#include <array>
#include <shared_mutex>

namespace KPRV::broker {

namespace {

/// All addresses that any host has handed out, in shards so that threads rarely wait for each other.
class Address_Book
{
public:
    void add(Object* object)
    {
        Shard& shard = at(object->address());
        const Auto_Lock lock(shard.mutex);
        shard.objects[object->address()] = object;
    }

    void remove(const Object* object)
    {
        Shard& shard = at(object->address());
        const Auto_Lock lock(shard.mutex);
        shard.objects.erase(object->address());
    }

    Object* find(const void* address)
    {
        Shard& shard = at(address);
        const Auto_Shared_Lock lock(shard.mutex);
        auto found = shard.objects.find(address);
        return found == shard.objects.end() ? nullptr : found->second;
    }

private:
    struct Shard
    {
        Standard_Mutex<std::shared_mutex> mutex;
        std::unordered_map<const void*, Object*> objects GUARDED_BY(mutex);
    };

    Shard& at(const void* address)
    {
        return shards_[(reinterpret_cast<std::uintptr_t>(address) >> 6) % shards_.size()];
    }

    std::array<Shard, 16> shards_;
};

Address_Book& address_book()
{
    static Address_Book book;
    return book;
}

} // namespace

Object* find_object(const void* address)
{
    return address ? address_book().find(address) : nullptr;
}

Core::~Core()
{
    for (auto& [object, owner] : objects_)
        address_book().remove(object);
    for (auto& object : retired_)
        address_book().remove(object.get());
}

void Core::adopt(std::unique_ptr<Object> object)
{
    Object* known = object.get();
    address_book().add(known);
    if (known->owner != Owner::HOST)
        ledger.made(known->kind, known->maker);
    const Auto_Lock lock(mutex_);
    objects_[known] = std::move(object);
}

void Core::retire(Object& object)
{
    object.live = false;
    object.drop();
    const Auto_Lock lock(mutex_);
    auto at = objects_.find(&object);
    if (at == objects_.end())
        return;
    retired_.push_back(std::move(at->second));
    objects_.erase(at);
    if (retired_.size() > options.most_shells) {
        address_book().remove(retired_.front().get());
        retired_.pop_front();
    }
}

} // namespace KPRV::broker
