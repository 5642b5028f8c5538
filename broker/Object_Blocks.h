#pragma once

#include "broker/Block_Memory.h"

#include <array>
#include <list>

namespace KPRV::broker {

struct Object;

/// Where the objects of one host lie, and what they hold: in blocks, each of places of one size, so that an
/// object costs no more than its size, and its address tells where to look whether it is one. Safe for any
/// thread.
class Object_Blocks
{
public:
    /// See `Block_Memory`.
    explicit Object_Blocks(std::size_t most_in_memory);
    ~Object_Blocks();
    Object_Blocks(const Object_Blocks&) = delete;
    Object_Blocks& operator=(const Object_Blocks&) = delete;

    /// A place for an object, of which nobody knows before `announce`: the host's part comes first, and
    /// behind it that which providers see. Throws `std::bad_alloc`.
    void* take_for_object(std::size_t size);
    void announce(const void* place);
    void give_object(void* place);
    /// Destroys an object that was announced, and gives its place back.
    void end(Object& object);

    /// A place for bytes that an object holds; large ones lie in the heap.
    char* take_bytes(std::size_t size);
    void give_bytes(char* place, std::size_t size);
    /// They are about to be read.
    void touch_bytes(const char* place, std::size_t size);

    /// One of the known objects; null if there is none.
    Object* any();

    /// The object of any host that was announced at this address, null for any other address, which is not
    /// read.
    static Object* find(const void* address);

    const Block_Memory& memory() const { return _memory; }

private:
    struct Places;
    /// Of one size.
    struct Row
    {
        std::list<Places> full;
        std::list<Places> free;
    };
    using Rows = std::array<Row, 65>;

    void* take(Rows& rows, std::size_t size) REQUIRES(_mutex);
    void give(Rows& rows, Places* places, void* place) REQUIRES(_mutex);
    void give_known(Places* places, void* place);
    static Places* places_of(const void* place);

    Block_Memory _memory;
    Standard_Mutex<> _mutex;
    Rows _objects GUARDED_BY(_mutex);
    Rows _bytes GUARDED_BY(_mutex);
};

} // namespace KPRV::broker
