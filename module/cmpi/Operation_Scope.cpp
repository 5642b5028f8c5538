#include "module/cmpi/Operation_Scope.h"

namespace KPRV {

Operation_Scope::Operation_Scope(CMPI_Adapter* adapter, const CMPIContext* context, const char* function,
                                 Call_Site site)
    : _adapter(adapter), _function(function), _context(adapter->broker, context, adapter),
      _lock(adapter->adapter_mutex)
{
    CMPI_Adapter::ent(site.file, site.line, function);
}

CMPIStatus Operation_Scope::ret(Call_Site site, CMPIrc rc) const
{
    CMPI_Adapter::ret(site.file, site.line, _function, rc);
    return {rc, nullptr};
}

CMPIStatus Operation_Scope::ret(Call_Site site, CMPIrc rc, const char* text) const
{
    CMPI_Adapter::ret(site.file, site.line, _function, rc, text);
    return {rc, nullptr};
}

CMPIStatus Operation_Scope::ret_ok(Call_Site site, CMPIrc traced) const
{
    CMPI_Adapter::ret(site.file, site.line, _function, traced);
    return {CMPI_RC_OK, nullptr};
}

} // namespace KPRV
