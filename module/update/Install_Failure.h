#pragma once

namespace KPRV {

/// Why an installation was refused or failed, in the words of the log. The client sees a return value only.
struct Install_Failure
{
    const char* text;
};

} // namespace KPRV
