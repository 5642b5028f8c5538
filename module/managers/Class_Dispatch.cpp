#include "module/managers/Class_Dispatch.h"

#include "module/adapter/ProviderUtil.h"

#include <algorithm>

namespace KPRV {

Array<Instance*> dispatch_class(Call_Site site, std::span<const Class_Row> rows, classId_t id,
                                const Wanted& wanted)
{
    LOG_LINE(INFO, site.file, site.line, "Requested classId : %d", static_cast<int>(id));
    LOG_LINE(INFO, site.file, site.line, "Requested class is: %s", ProviderUtil::getClassName(id));

    const auto row = std::ranges::find(rows, id, &Class_Row::id);
    if (row == rows.end()) {
        LOG_LINE(INFO, site.file, site.line, "Requested class is NOT supported.");
        return {};
    }
    if (row->needs == Needs::DRIVER && !ProviderUtil::getDriverStatus()) {
        LOG_LINE(ERR, site.file, site.line,
                 "Driver is not installed or there is a zntl mismatch hence no instances returned");
        return {};
    }
    return row->source(id, wanted);
}

} // namespace KPRV
