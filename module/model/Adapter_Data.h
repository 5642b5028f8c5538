#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

/// What the builders know of one adapter. Texts are cut to their field and always terminated; an unknown one
/// is empty. An adapter is either an FC HBA, which goes by its node WWN, or a CNA, which goes by its MAC.
struct _adapterData
{
    char nodeWWN[24];  ///< Flat form; only with a storage driver.
    char mac[18];      ///< Flat form; CNA only.
    sint32 status;     ///< 11 in service, 10 stopped.
    String systemName; ///< At most 255 characters.
    char model[16];
    char serialNumber[64];
    char vendor[16];
    char fruNumber[16];
    char partNumber[16];
    char storageDriverName[16];
    char storageDriverVersion[64];
    char networkDriverName[16];
    char networkDriverVersion[64];
    char firmwareVersion[64];
    char biosVersion[64]; ///< Only for software identities.
    bool isCNA;
    char uuid[33];

    const char* address() const { return isCNA ? mac : nodeWWN; }
};

} // namespace KPRV
