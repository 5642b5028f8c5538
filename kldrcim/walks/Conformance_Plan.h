#pragma once

namespace KPRV::kldrcim {

/// What a client of the Storage HBA profile expects at one step of its walk. Objects of a step are known by
/// its name to the steps behind it.
struct Conformance_Step
{
    /// Heading that the step begins; null where it goes on under the one before.
    const char* section;
    /// What the objects are called.
    const char* name;
    /// Name of the step whose objects the walk starts at; null for an enumeration of the class, of which the
    /// one with `name` as its `RegisteredName` is kept.
    const char* from;
    /// Null for an enumeration. A class of the CIM Schema: a client knows no other.
    const char* association;
    /// Roles of the object where the step starts, and of those that it finds.
    const char* near_role;
    const char* far_role;
    const char* class_name;
    /// How many of them each object of `from` must have.
    unsigned least;
    unsigned most;
    /// Properties that must have a value in each, with blanks between them.
    const char* properties;
};

/// For `most`: as many as there are.
constexpr unsigned MANY = ~0u;

/// All steps in the order of the walk; the last one has no name.
extern const Conformance_Step conformance_steps[];

} // namespace KPRV::kldrcim
