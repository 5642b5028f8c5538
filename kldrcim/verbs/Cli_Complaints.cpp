#include "kldrcim/verbs/Cli_Complaints.h"

#include <cstdio>

namespace KPRV::kldrcim {

int complain(const std::string& text, int status)
{
    std::fprintf(stderr, "kldrcim: %s\n", text.c_str());
    return status;
}

std::string failure_text(const Result& result)
{
    const std::string text = code_text(result.rc);
    if (result.exception)
        return text + ": an exception left the provider: " + *result.exception;
    return result.message.empty() ? text : text + ": " + result.message;
}

void warn_of(const std::vector<Provider_Failure>& failures)
{
    for (const Provider_Failure& failure : failures)
        complain("warning: no answer from " + failure.provider_class + ": " + code_text(failure.rc) +
                     (failure.message.empty() ? "" : ": " + failure.message),
                 0);
}

} // namespace KPRV::kldrcim
