// The example of docs/design/objects.md: what the page draws is what the compiler makes of it.

#include "module/runtime/ground/Property.h"
#include "module/runtime/objects/Class_Plan.h"

// Other files of the program may have an example, too.
namespace KPRV::objects_page {

struct Example : Instance
{
    Property<String> Name;
    Property<uint16> Status;
    Property<Array<uint16>> Codes;
    Property<uint64> Speed;
    Example* System;
    Property<Array<Instance*>> Others;
};

constexpr size_t at(size_t on_32, size_t on_64)
{
    return sizeof(void*) == 4 ? on_32 : on_64;
}

// clang-format off
static_assert(offsetof(Example, Name.value)   == at(16, 24));
static_assert(offsetof(Example, Name.null)    == at(20, 32));
static_assert(offsetof(Example, Status.value) == at(24, 40));
static_assert(offsetof(Example, Status.null)  == at(26, 42));
static_assert(offsetof(Example, Codes.value)  == at(28, 48));
static_assert(offsetof(Example, Codes.null)   == at(32, 56));
static_assert(offsetof(Example, Speed.value)  == at(36, 64));
static_assert(offsetof(Example, Speed.null)   == at(44, 72));
static_assert(offsetof(Example, System)       == at(48, 80));
static_assert(offsetof(Example, Others.value) == at(52, 88));
static_assert(offsetof(Example, Others.null)  == at(56, 96));
static_assert(sizeof(Example) == at(60, 104));
static_assert(sizeof(Cell)    == at(12, 16));
// clang-format on

} // namespace KPRV::objects_page
