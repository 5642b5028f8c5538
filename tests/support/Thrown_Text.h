#pragma once

#include "broker/values/Request.h"

#include <cstdlib>
#include <optional>
#include <string>

namespace KPRV {

/// The library under test: that of the build, or, where KLDR_TEST_MODULE names one, another.
inline const char* module_under_test()
{
    const char* const named = std::getenv("KLDR_TEST_MODULE");
    return named ? named : KLDR_MODULE;
}

/// Whether that library contains exceptions; the other one that is built has the other form.
inline bool contains_exceptions()
{
    return std::getenv("KLDR_TEST_MODULE") ? !KLDR_CONTAINS_EXCEPTIONS : KLDR_CONTAINS_EXCEPTIONS;
}

/// Whether what the host calls a breach of the contract is an exception that the library under test may let
/// out.
inline bool is_passed_exception(const std::string& violation)
{
    return !contains_exceptions() && violation.starts_with("MI entry: an exception left the provider: ");
}

/// What an operation threw: as an exception that left the provider or, from a module that contains
/// exceptions, in the message behind the name of its entry. The module has no other messages. Nothing for an
/// operation that did not throw.
inline std::optional<std::string> thrown_text(const broker::Result& result)
{
    if (result.exception || result.message.empty())
        return result.exception;
    return result.message.substr(result.message.find(": ") + 2);
}

} // namespace KPRV
