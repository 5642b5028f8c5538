// The binary contract, held by the compiler: this file is built at each level, and it builds only where every
// size, offset, slot and constant is right. Sizes come in pairs: 32-bit, then 64-bit.
#include "contracts/cmpi/cmpimacs.h"

#include <cstddef>
#include <type_traits>

namespace {

constexpr std::size_t pick(std::size_t on_32_bit, std::size_t on_64_bit)
{
    return sizeof(void*) == 4 ? on_32_bit : on_64_bit;
}

// Tables that begin with two 32-bit words: on 64-bit platforms the two share the first slot.
constexpr std::size_t two_word_offset(std::size_t slot)
{
    return slot < 2 ? 4 * slot : pick(4 * slot, 8 * (slot - 1));
}

#define SCALAR(type, size, align_32, align_64)                                                               \
    static_assert(sizeof(type) == size && alignof(type) == pick(align_32, align_64), #type);
SCALAR(CMPIBoolean, 1, 1, 1)
SCALAR(CMPIChar16, 2, 2, 2)
SCALAR(CMPIUint8, 1, 1, 1)
SCALAR(CMPIUint16, 2, 2, 2)
SCALAR(CMPIUint32, 4, 4, 4)
SCALAR(CMPISint8, 1, 1, 1)
SCALAR(CMPISint16, 2, 2, 2)
SCALAR(CMPISint32, 4, 4, 4)
SCALAR(CMPIReal32, 4, 4, 4)
SCALAR(CMPICount, 4, 4, 4)
SCALAR(CMPIType, 2, 2, 2)
SCALAR(CMPIValueState, 2, 2, 2)
SCALAR(CMPIFlags, 4, 4, 4)
SCALAR(CMPIVersion, 4, 4, 4)
SCALAR(CMPIrc, 4, 4, 4)
SCALAR(CMPIMsgFileHandle, sizeof(void*), 4, 8)

// A 64-bit number is aligned to 8 on i386 when it stands alone, but to 4 inside a struct.
template <class T>
struct Member
{
    char before;
    T value;
};
#define WIDE(type) static_assert(sizeof(type) == 8 && offsetof(Member<type>, value) == pick(4, 8), #type);
WIDE(CMPIUint64)
WIDE(CMPISint64)
WIDE(CMPIReal64)

#define LAYOUT(type, size_32, align_32, size_64, align_64)                                                   \
    static_assert(sizeof(type) == pick(size_32, size_64) && alignof(type) == pick(align_32, align_64), #type);
LAYOUT(CMPIValuePtr, 8, 4, 16, 8)
LAYOUT(CMPIValue, 8, 4, 16, 8)
LAYOUT(CMPIData, 12, 4, 24, 8)
LAYOUT(CMPIStatus, 8, 4, 16, 8)

#define OFFSET(type, member, member_type, offset_32, offset_64)                                              \
    static_assert(offsetof(type, member) == pick(offset_32, offset_64), #type "::" #member);                 \
    static_assert(std::is_same_v<decltype(type::member), member_type>, #type "::" #member);
OFFSET(CMPIValuePtr, ptr, void*, 0, 0)
OFFSET(CMPIValuePtr, length, CMPICount, 4, 8)
OFFSET(CMPIData, type, CMPIType, 0, 0)
OFFSET(CMPIData, state, CMPIValueState, 2, 2)
OFFSET(CMPIData, value, CMPIValue, 4, 8)
OFFSET(CMPIStatus, rc, CMPIrc, 0, 0)
OFFSET(CMPIStatus, msg, CMPIString*, 4, 8)
OFFSET(CMPIBroker, hdl, const void*, 0, 0)
OFFSET(CMPIBroker, bft, const CMPIBrokerFT*, 4, 8)
OFFSET(CMPIBroker, eft, const CMPIBrokerEncFT*, 8, 16)
OFFSET(CMPIBroker, xft, const CMPIBrokerExtFT*, 12, 24)
#if CMPI_VERSION >= 200
OFFSET(CMPIBroker, mft, const CMPIBrokerMemFT*, 16, 32)
#endif

// Otherwise C++ would pass and return them by another convention than the C server.
static_assert(std::is_trivially_copyable_v<CMPIData> && std::is_trivially_copyable_v<CMPIStatus>);
static_assert(std::is_same_v<std::underlying_type_t<CMPIrc>, int>);

#define UNION_MEMBER(member, type)                                                                           \
    static_assert(std::is_same_v<decltype(CMPIValue::member), type> && offsetof(CMPIValue, member) == 0,     \
                  #member);
UNION_MEMBER(boolean, CMPIBoolean)
UNION_MEMBER(char16, CMPIChar16)
UNION_MEMBER(uint8, CMPIUint8)
UNION_MEMBER(uint16, CMPIUint16)
UNION_MEMBER(uint32, CMPIUint32)
UNION_MEMBER(uint64, CMPIUint64)
UNION_MEMBER(sint8, CMPISint8)
UNION_MEMBER(sint16, CMPISint16)
UNION_MEMBER(sint32, CMPISint32)
UNION_MEMBER(sint64, CMPISint64)
UNION_MEMBER(real32, CMPIReal32)
UNION_MEMBER(real64, CMPIReal64)
UNION_MEMBER(inst, CMPIInstance*)
UNION_MEMBER(ref, CMPIObjectPath*)
UNION_MEMBER(args, CMPIArgs*)
UNION_MEMBER(filter, CMPISelectExp*)
UNION_MEMBER(Enum, CMPIEnumeration*)
UNION_MEMBER(array, CMPIArray*)
UNION_MEMBER(string, CMPIString*)
UNION_MEMBER(chars, char*)
UNION_MEMBER(dateTime, CMPIDateTime*)
UNION_MEMBER(dataPtr, CMPIValuePtr)

#define OBJECT(type)                                                                                         \
    static_assert(sizeof(type) == 2 * sizeof(void*) && offsetof(type, hdl) == 0 &&                           \
                      offsetof(type, ft) == sizeof(void*),                                                   \
                  #type);
OBJECT(CMPIContext)
OBJECT(CMPIResult)
OBJECT(CMPIString)
OBJECT(CMPIArray)
OBJECT(CMPIEnumeration)
OBJECT(CMPIInstance)
OBJECT(CMPIObjectPath)
OBJECT(CMPIArgs)
OBJECT(CMPIDateTime)
OBJECT(CMPISelectExp)
OBJECT(CMPISelectCond)
OBJECT(CMPISubCond)
OBJECT(CMPIPredicate)
OBJECT(CMPIError)
OBJECT(CMPIPropertyList)
OBJECT(CMPIEnumerationFilter)
OBJECT(CMPIInstanceMI)
OBJECT(CMPIAssociationMI)
OBJECT(CMPIMethodMI)
OBJECT(CMPIPropertyMI)
OBJECT(CMPIIndicationMI)

#define SIZES(type, a32, a64, b32, b64, c32, c64)                                                            \
    static_assert(sizeof(type) == (CMPI_VERSION >= 210   ? pick(c32, c64)                                    \
                                   : CMPI_VERSION >= 200 ? pick(b32, b64)                                    \
                                                         : pick(a32, a64)),                                  \
                  "size of " #type);
#include "sizes.inc"

#define CHECK_SLOT(table, offset, member, ...)                                                               \
    static_assert(offsetof(table, member) == (offset), #table "::" #member " stands in the wrong slot");     \
    static_assert(std::is_same_v<decltype(table::member), __VA_ARGS__>,                                      \
                  #table "::" #member " has the wrong type");
#define SLOT(table, slot, member, ...) CHECK_SLOT(table, (slot) * sizeof(void*), member, __VA_ARGS__)
#define TWO_WORD_SLOT(table, slot, member, ...) CHECK_SLOT(table, two_word_offset(slot), member, __VA_ARGS__)
#include "broker_slots.inc"
#include "mi_slots.inc"
#include "object_slots.inc"

#define CONSTANT(name, value) static_assert(name == (value), #name);
#include "constants.inc"

constexpr bool same_text(const char* a, const char* b)
{
    while (*a && *a == *b)
        ++a, ++b;
    return *a == *b;
}
static_assert(same_text(CMPIInitNameSpace, "CMPIInitNameSpace"));
static_assert(same_text(CMPIInvocationFlags, "CMPIInvocationFlags"));
static_assert(same_text(CMPIPrincipal, "CMPIPrincipal"));
static_assert(same_text(CMPIRole, "CMPIRole"));
static_assert(same_text(CMPIAcceptLanguage, "CMPIAcceptLanguage"));
static_assert(same_text(CMPIContentLanguage, "CMPIContentLanguage"));

} // namespace
