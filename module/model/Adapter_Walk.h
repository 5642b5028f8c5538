#pragma once

#include "module/adapter/Adapter_List.h"
#include "module/model/Fresh_Instances.h"

namespace KPRV {

/// Joins what a visitor finds on each adapter: `visit(adapter_id, list, instances)`, with ids from 1 and the
/// list of addresses that they count. The lines of its log are the caller's; the library's exceptions pass.
template <class Visit>
Array<Instance*> walk_adapters(Call_Site site, Visit visit)
{
    Json::Value response;
    const Json::Value* list = query_adapter_list(site, response);
    if (!list)
        return {};
    const int count = static_cast<int>(list->size());
    if (count == 0)
        LOG_LINE(WARN, site.file, site.line, "No adapters in the system. ");
    Fresh_Instances instances;
    for (int adapter_id = 1; adapter_id <= count; adapter_id++)
        visit(adapter_id, *list, instances);
    return instances.release();
}

} // namespace KPRV
