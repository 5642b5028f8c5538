#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

/// Brings the image that a URI names onto the host and gives its local name.
///
/// - `file://NAME` names a file of this host; NAME may be relative to the server's working folder.
/// - `tftp://HOST/NAME` is fetched with the host's tftp client into the working folder, under NAME, in place
///   of a file of that name. It stays there whatever comes of the installation. This takes as long as the
///   client takes.
///
/// The schemes are compared with case. Throws `Install_Failure` for any other URI, for one without a name,
/// for a host of fewer than two characters, and where the client reports a failure. That the file exists is
/// not checked.
String fetch_firmware(const String& uri);

} // namespace KPRV
