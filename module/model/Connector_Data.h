#pragma once

#include <json/value.h>

namespace KPRV {

/// What the builder knows of one transceiver. Texts are cut to their field and always terminated; an unknown
/// one is empty. They come without blanks around them, but for the extended id and the speed.
struct _sfpInfo
{
    char vendorName[18];
    char vendorPart[18];
    char serialNumber[18];
    char tag[32]; ///< Serial number, adapter id and port index, joined by "_".
    char extendedID[8];
    char speed[32];
    char revision[6];
};

/// Fills the record from an answer of `getOpticsSFP`. Adapter ids count from 1, ports from 0. Throws
/// `Not_Convertible` for a member of the wrong type.
void fill_sfp(const Json::Value& answer, int adapter_id, int port_index, _sfpInfo& sfp);

} // namespace KPRV
