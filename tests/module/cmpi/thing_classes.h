#pragma once

// One more class by hand, with what only the server's side makes interesting: keys of several widths,
// references that are not embedded, and methods of unusual shape. It is a provider's class of its own.

#include "tests/module/runtime/dispatch/Scripted_Provider.h"

namespace KPRV {

extern const Meta_Repository thing_repository;

struct Thing : Instance
{
    Property<uint16> Small;
    Property<sint32> Signed;
    Property<uint32> Word;
    Property<Datetime> When;
    Instance* Friend;
    Property<Array<Instance*>> Friends;
    static const Meta_Class static_meta_class;
};

/// Takes references in every way, and answers a text.
struct Thing_Choose_method : Instance
{
    Property<Array<Instance*>> Candidates;
    Instance* Who;
    Instance* Chosen;
    Property<Array<String>> Reasons;
    Property<String> return_value;
    static const Meta_Method static_meta_class;
};

/// "Thing", named like its class; and "Count", a static method.
struct Thing_plain_method : Instance
{
    Property<uint32> return_value;
    static const Meta_Method named_like_class;
    static const Meta_Method static_meta_class;
};

constexpr Meta_Property thing_property(const char* name, uint32 flags, uint16 type, sint16 subscript,
                                       size_t at)
{
    return {{{0, FLAG_PROPERTY | flags, name, nullptr, 0}}, type, subscript, uint32(at), nullptr};
}

constexpr Meta_Reference thing_reference(const char* name, uint32 flags, sint16 subscript, size_t at)
{
    return {{{0, FLAG_REFERENCE | flags, name, nullptr, 0}},
            subscript,
            &Sample_Element::static_meta_class,
            uint32(at)};
}

template <size_t N>
constexpr Meta_Method thing_method(const char* name, uint32 flags, const Meta_Feature* const (&features)[N],
                                   size_t size, Type type)
{
    return {{{0, FLAG_METHOD | flags, name, nullptr, 0}}, features, N, uint32(size), type};
}

// clang-format off
inline constexpr Meta_Property _Thing_Small = thing_property("Small", FLAG_KEY, UINT16, 0, offsetof(Thing, Small));
inline constexpr Meta_Property _Thing_Signed = thing_property("Signed", FLAG_KEY, SINT32, 0, offsetof(Thing, Signed));
inline constexpr Meta_Property _Thing_Word = thing_property("Word", FLAG_KEY, UINT32, 0, offsetof(Thing, Word));
inline constexpr Meta_Property _Thing_When = thing_property("When", FLAG_KEY, DATETIME, 0, offsetof(Thing, When));
inline constexpr Meta_Reference _Thing_Friend = thing_reference("Friend", 0, 0, offsetof(Thing, Friend));
inline constexpr Meta_Reference _Thing_Friends = thing_reference("Friends", 0, -1, offsetof(Thing, Friends));

inline constexpr Meta_Reference _Choose_Candidates = thing_reference("Candidates", FLAG_IN | FLAG_EMBEDDED_INSTANCE, -1, offsetof(Thing_Choose_method, Candidates));
inline constexpr Meta_Reference _Choose_Who = thing_reference("Who", FLAG_IN, 0, offsetof(Thing_Choose_method, Who));
inline constexpr Meta_Reference _Choose_Chosen = thing_reference("Chosen", FLAG_OUT, 0, offsetof(Thing_Choose_method, Chosen));
inline constexpr Meta_Property _Choose_Reasons = thing_property("Reasons", FLAG_OUT, STRING, -1, offsetof(Thing_Choose_method, Reasons));
inline constexpr Meta_Property _Choose_return_value = thing_property("return_value", FLAG_OUT, STRING, 0, offsetof(Thing_Choose_method, return_value));
inline constexpr Meta_Property _plain_return_value = thing_property("return_value", FLAG_OUT, UINT32, 0, offsetof(Thing_plain_method, return_value));
// clang-format on

inline constexpr const Meta_Feature* _Choose_MFA[] = {
    &_Choose_Candidates, &_Choose_Who, &_Choose_Chosen, &_Choose_Reasons, &_Choose_return_value,
};
inline constexpr const Meta_Feature* _plain_MFA[] = {&_plain_return_value};

inline constexpr Meta_Method Thing_Choose_method::static_meta_class =
    thing_method("Choose", 0, _Choose_MFA, sizeof(Thing_Choose_method), STRING);
inline constexpr Meta_Method Thing_plain_method::named_like_class =
    thing_method("Thing", 0, _plain_MFA, sizeof(Thing_plain_method), UINT32);
inline constexpr Meta_Method Thing_plain_method::static_meta_class =
    thing_method("Count", FLAG_STATIC, _plain_MFA, sizeof(Thing_plain_method), UINT32);

inline constexpr const Meta_Feature* _Thing_MFA[] = {
    &_Thing_Small,
    &_Thing_Signed,
    &_Thing_Word,
    &_Thing_When,
    &_Thing_Friend,
    &_Thing_Friends,
    &Thing_Choose_method::static_meta_class,
    &Thing_plain_method::named_like_class,
    &Thing_plain_method::static_meta_class,
};
inline constexpr Meta_Class Thing::static_meta_class = {{{0, FLAG_CLASS, "Thing", nullptr, 0}},
                                                        _Thing_MFA,
                                                        std::size(_Thing_MFA),
                                                        sizeof(Thing),
                                                        nullptr,
                                                        nullptr,
                                                        4,
                                                        &thing_repository};

/// The samples and this class.
inline constexpr const Meta_Class* thing_meta_classes[] = {
    &Thing::static_meta_class,       &Sample_Types::static_meta_class, &Sample_Element::static_meta_class,
    &Sample_Port::static_meta_class, &Sample_Other::static_meta_class, &Sample_Group::static_meta_class,
    &Sample_Link::static_meta_class,
};
inline constexpr Meta_Repository thing_repository = {thing_meta_classes, std::size(thing_meta_classes)};

inline constexpr const Registration* thing_registration =
    &scripted_registration<Thing, Provider_Kind::INSTANCE>;

} // namespace KPRV
