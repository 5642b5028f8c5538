#pragma once

#include "broker/values/Request.h"
#include "broker/values/Type_Words.h"

#include <string>
#include <vector>

namespace KPRV::kldrcim {

using namespace broker;

// What kldrcim says on standard error, one line each.

/// Exit status of what was understood and did not succeed.
inline constexpr int FAILURE = 1;
/// That of wrong usage.
inline constexpr int USAGE_ERROR = 2;

/// "kldrcim: TEXT"; gives the status back.
int complain(const std::string& text, int status);

/// The code of an answer that failed, then the exception or the message, if there is one.
std::string failure_text(const Result& result);

/// A warning for each: what is missing from an answer should not look as if it were not there.
void warn_of(const std::vector<Provider_Failure>& failures);

} // namespace KPRV::kldrcim
