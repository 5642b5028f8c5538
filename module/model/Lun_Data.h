#pragma once

#include "module/model/Record_Filling.h"
#include "module/runtime/ground/Types.h"

#include <json/value.h>

#include <string_view>

namespace KPRV {

/// What the builders know of one LUN of a remote port. Texts are cut to their field and stand in the answer
/// that they are read from; an unknown one is empty.
struct _hbaLunInfo
{
    uint32 number;
    std::string_view
        path; ///< Where it is seen: the flat addresses of local and remote port, "_" behind each.
    Cut_Text vendor;
    Cut_Text productID;
    Cut_Text serialNumber; ///< Only where it names the LUN.
    Cut_Text deviceName;   ///< Nothing fills it yet.
    Cut_Text description;
    uint32 idType; ///< What identifies the LUN; decides on the form of its name.
};

/// Fills the record, but for `path`, from an element of `lunList` of a remote port; false if it lacks what a
/// LUN must have.
/// `no_description_seen` is the walk's: it is set by the first LUN without a description and from then on
/// decides for all. Throws `Not_Convertible` for a member of the wrong type.
bool fill_lun(const Json::Value& element, bool& no_description_seen, _hbaLunInfo& lun);

} // namespace KPRV
