#pragma once

#include "kldrcim/connection/Connection.h"

#include <span>

namespace KPRV::kldrcim {

using namespace broker;

/// The superclass of all hardware tests.
inline constexpr const char* test_class = "KALDERA_DiagnosticTest";

/// A kind of thing that can be tested.
struct Element_Kind
{
    const char* class_name;
    const char* words;
    /// The test classes that take it, apart by blanks.
    const char* test_classes;
};

std::span<const Element_Kind> element_kinds();

/// What the tests of a class can be run on, in words.
std::string element_words(const std::string& test_class_name);

/// The test of that name, with or without "Kaldera:" and in any letter case. False with a one-line `error`.
bool find_test(Connection& connection, const std::string& name, Path_Value& path, std::string& error);

/// The element with that address: index form, flat form or dashes, in any letter case; or by its path. Where
/// an adapter and its port share the address, the test decides. A path, and an element of a kind that the
/// test does not take, is left to the module to refuse.
bool find_element(Connection& connection, const std::string& test_class_name, const std::string& text,
                  Path_Value& path, std::string& error);

} // namespace KPRV::kldrcim
