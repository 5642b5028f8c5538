#include "broker/Object_Blocks.h"

#include "broker/Object.h"

#include <bit>
#include <cstdint>
#include <sanitizer/asan_interface.h>
#include <shared_mutex>
#include <unordered_map>

namespace KPRV::broker {

namespace {

constexpr std::size_t BLOCK_SIZE = Block_Memory::BLOCK_SIZE;
/// Bytes beyond that lie in the heap, so that a block holds many places.
constexpr std::size_t LARGEST = 8192;

/// Small places differ by 16 bytes, larger ones by 256.
constexpr std::size_t row_of(std::size_t size)
{
    return size <= 512 ? (size + 15) / 16 : 32 + (size + 255) / 256;
}
constexpr std::size_t place_size(std::size_t row)
{
    return row <= 32 ? row * 16 : (row - 32) * 256;
}
static_assert(row_of(LARGEST) == 64 && place_size(row_of(513)) == 768);

/// The part that providers see stands behind the host's.
constexpr std::size_t SEEN_FROM = sizeof(Object);

std::size_t begin_of_block(const void* address)
{
    return reinterpret_cast<std::uintptr_t>(address) / BLOCK_SIZE * BLOCK_SIZE;
}

/// Where a sanitizer looks, each text lies for itself.
#if defined(__SANITIZE_ADDRESS__)
constexpr bool bytes_in_blocks = false;
#else
constexpr bool bytes_in_blocks = true;
#endif

} // namespace

/// One block.
struct Object_Blocks::Places
{
    Places(Object_Blocks& blocks, std::size_t row_number)
        : owner(blocks), row(row_number), size(place_size(row_number)), free(BLOCK_SIZE / size),
          taken((free + 63) / 64), known(taken.size())
    {
        // No place begins behind the last whole one.
        for (std::size_t i = free; i < taken.size() * 64; ++i)
            taken[i / 64] |= std::uint64_t(1) << i % 64;
        owner._memory.take(block);
    }
    ~Places()
    {
        ASAN_UNPOISON_MEMORY_REGION(block.begin, BLOCK_SIZE);
        owner._memory.give(block);
    }
    Places(const Places&) = delete;
    Places& operator=(const Places&) = delete;

    std::size_t count() const { return BLOCK_SIZE / size; }
    std::size_t number_of(const void* place) const
    {
        return static_cast<std::size_t>(static_cast<const char*>(place) - block.begin) / size;
    }
    void* take()
    {
        while (!~taken[first])
            ++first;
        const auto bit = static_cast<std::size_t>(std::countr_one(taken[first]));
        taken[first] |= std::uint64_t(1) << bit;
        --free;
        void* const place = block.begin + (first * 64 + bit) * size;
        ASAN_UNPOISON_MEMORY_REGION(place, size);
        owner._memory.touch(block);
        return place;
    }
    void give(void* place)
    {
        const std::size_t number = number_of(place);
        taken[number / 64] &= ~(std::uint64_t(1) << number % 64);
        first = std::min(first, number / 64);
        ++free;
        ASAN_POISON_MEMORY_REGION(place, size);
    }
    void know(const void* place, bool yes)
    {
        const std::size_t number = number_of(place);
        const std::uint64_t bit = std::uint64_t(1) << number % 64;
        if (yes)
            known[number / 64].fetch_or(bit, std::memory_order_release);
        else
            known[number / 64].fetch_and(~bit, std::memory_order_release);
    }
    Object* object(std::size_t number) const
    {
        return reinterpret_cast<Object*>(block.begin + number * size);
    }
    Object* find(const void* address)
    {
        const std::size_t number = number_of(address);
        if (number >= count() || address != block.begin + number * size + SEEN_FROM ||
            !(known[number / 64].load(std::memory_order_acquire) >> number % 64 & 1))
            return nullptr;
        owner._memory.touch(block);
        return object(number);
    }

    Object_Blocks& owner;
    const std::size_t row;
    const std::size_t size;
    std::size_t free;
    Block_Memory::Block block;
    /// Bits, one a place; those of `taken` are under the owner's mutex.
    std::vector<std::uint64_t> taken;
    std::vector<std::atomic<std::uint64_t>> known;
    /// Words before it have no free place.
    std::size_t first = 0;
    std::list<Places>::iterator self;
};

namespace {

/// The blocks of all hosts, in shards so that threads rarely wait for each other.
template <class Places>
class Address_Book
{
public:
    void add(Places* places)
    {
        Shard& shard = at(places->block.begin);
        const Auto_Lock lock(shard.mutex);
        shard.blocks[begin_of_block(places->block.begin)] = places;
    }

    void remove(const void* address)
    {
        Shard& shard = at(address);
        const Auto_Lock lock(shard.mutex);
        shard.blocks.erase(begin_of_block(address));
    }

    /// What the function makes of the block, under the lock that keeps the block; null without one.
    template <class Function>
    auto with(const void* address, Function function) -> decltype(function(std::declval<Places&>()))
    {
        Shard& shard = at(address);
        const Auto_Shared_Lock lock(shard.mutex);
        const auto found = shard.blocks.find(begin_of_block(address));
        return found == shard.blocks.end() ? nullptr : function(*found->second);
    }

private:
    struct Shard
    {
        Standard_Mutex<std::shared_mutex> mutex;
        std::unordered_map<std::size_t, Places*> blocks GUARDED_BY(mutex);
    };

    Shard& at(const void* address) { return _shards[begin_of_block(address) / BLOCK_SIZE % _shards.size()]; }

    std::array<Shard, 16> _shards;
};

template <class Places>
Address_Book<Places>& address_book()
{
    static Address_Book<Places> book;
    return book;
}

} // namespace

Object_Blocks::Object_Blocks(std::size_t most_in_memory) : _memory(most_in_memory) {}

Object_Blocks::~Object_Blocks()
{
    for (Rows* const rows : {&_objects, &_bytes})
        for (Row& row : *rows)
            for (std::list<Places>* const list : {&row.full, &row.free})
                for (const Places& places : *list)
                    address_book<Places>().remove(places.block.begin);
}

void* Object_Blocks::take(Rows& rows, std::size_t size)
{
    Row& row = rows[row_of(size)];
    if (row.free.empty()) {
        row.free.emplace_front(*this, row_of(size));
        row.free.front().self = row.free.begin();
        try {
            address_book<Places>().add(&row.free.front());
        } catch (...) {
            row.free.pop_front();
            throw;
        }
    }
    Places& places = row.free.front();
    void* const place = places.take();
    if (places.free == 0)
        row.full.splice(row.full.begin(), row.free, places.self);
    return place;
}

Object_Blocks::Places* Object_Blocks::places_of(const void* place)
{
    return address_book<Places>().with(place, [](Places& found) { return &found; });
}

void Object_Blocks::give(Rows& rows, Places* places, void* place)
{
    Row& row = rows[places->row];
    if (places->free == 0)
        row.free.splice(row.free.end(), row.full, places->self);
    places->give(place);
    // One stays for what comes next.
    if (places->free == places->count() && row.free.size() > 1) {
        address_book<Places>().remove(place);
        row.free.erase(places->self);
    }
}

void* Object_Blocks::take_for_object(std::size_t size)
{
    const Auto_Lock lock(_mutex);
    return take(_objects, size);
}

void Object_Blocks::announce(const void* place)
{
    address_book<Places>().with(place, [&](Places& places) {
        places.know(place, true);
        return &places;
    });
}

void Object_Blocks::give_object(void* place)
{
    give_known(places_of(place), place);
}

void Object_Blocks::give_known(Places* places, void* place)
{
    places->know(place, false);
    const Auto_Lock lock(_mutex);
    give(_objects, places, place);
}

void Object_Blocks::end(Object& object)
{
    // The block stays while the object stands in it.
    Places* const places = places_of(&object);
    _memory.touch(places->block);
    object.~Object();
    give_known(places, &object);
}

char* Object_Blocks::take_bytes(std::size_t size)
{
    if (!bytes_in_blocks || size > LARGEST)
        return static_cast<char*>(::operator new(size));
    const Auto_Lock lock(_mutex);
    return static_cast<char*>(take(_bytes, size));
}

void Object_Blocks::give_bytes(char* place, std::size_t size)
{
    if (!bytes_in_blocks || size > LARGEST)
        return ::operator delete(place);
    Places* const places = places_of(place);
    const Auto_Lock lock(_mutex);
    give(_bytes, places, place);
}

void Object_Blocks::touch_bytes(const char* place, std::size_t size)
{
    if (bytes_in_blocks && size <= LARGEST)
        address_book<Places>().with(place, [&](Places& places) {
            _memory.touch(places.block);
            return &places;
        });
}

Object* Object_Blocks::any()
{
    const Auto_Lock lock(_mutex);
    for (Row& row : _objects)
        for (std::list<Places>* const list : {&row.full, &row.free})
            for (const Places& places : *list)
                for (std::size_t i = 0; i < places.known.size(); ++i)
                    if (const std::uint64_t bits = places.known[i].load(std::memory_order_acquire))
                        return places.object(i * 64 + static_cast<std::size_t>(std::countr_zero(bits)));
    return nullptr;
}

Object* Object_Blocks::find(const void* address)
{
    return address_book<Places>().with(address, [&](Places& places) { return places.find(address); });
}

} // namespace KPRV::broker
