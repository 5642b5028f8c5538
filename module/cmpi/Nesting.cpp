#include "module/cmpi/Nesting.h"

#include "module/runtime/system/log.h"

namespace KPRV {

bool may_descend(unsigned depth)
{
    if (depth < MOST_NESTED_REFERENCES)
        return true;
    LOG_CONVERSION(ERR, "references nested deeper than %u levels", MOST_NESTED_REFERENCES);
    return false;
}

} // namespace KPRV
