#pragma once

#include "module/runtime/Types.h"

#include <json/value.h>

namespace KPRV {

/// What the builders know of one LUN of a remote port. Texts are cut to their field and always terminated;
/// an unknown one is empty.
struct _hbaLunInfo
{
    uint32 number;
    char remoteWWN[24]; ///< Flat form.
    char vendor[9];
    char productID[17];
    char serialNumber[65]; ///< Only where it names the LUN.
    char deviceName[65];   ///< Nothing fills it yet.
    char description[65];
    uint32 idType; ///< What identifies the LUN; decides on the form of its name.
};

/// Fills the record from an element of `lunList` of a remote port, given by its flat address; false if it
/// lacks what a LUN must have.
/// `no_description_seen` is the walk's: it is set by the first LUN without a description and from then on
/// decides for all. Throws `Not_Convertible` for a member of the wrong type.
bool fill_lun(const Json::Value& element, const char* remote_wwn, bool& no_description_seen,
              _hbaLunInfo& lun);

} // namespace KPRV
