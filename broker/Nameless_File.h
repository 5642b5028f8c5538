#pragma once

namespace KPRV::broker {

/// A new file that has no name and is gone when it is closed, in the folder that TMPDIR names or in /var/tmp.
/// Its descriptor, which is the caller's; negative, with errno, if the folder takes none.
int nameless_file();

} // namespace KPRV::broker
