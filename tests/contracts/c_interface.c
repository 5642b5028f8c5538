/* Providers are written in C too: the headers and the convenience calls must be good C11. */
#include "contracts/cmpi/cmpimacs.h"

_Static_assert(sizeof(CMPIrc) == 4, "return codes take four bytes");
_Static_assert(sizeof(CMPIData) == (sizeof(void*) == 4 ? 12 : 24), "CMPIData");

CMPIStatus exercise(const CMPIBroker* mb, CMPIInstance* inst, const CMPIResult* rslt);

CMPIStatus exercise(const CMPIBroker* mb, CMPIInstance* inst, const CMPIResult* rslt)
{
    CMPIStatus rc = {CMPI_RC_OK, 0};
    CMPIString* text = CMNewString(mb, "text", &rc);
    CMPIInstance* copy = CMClone(inst, &rc);
    CMSetProperty(copy, "Name", &text, CMPI_string);
    CMSetProperty(copy, "Other", "characters", CMPI_chars);
    CMReturnInstance(rslt, copy);
    CMRelease(text);
    return CMRelease(copy);
}
