// Keeps whoever opens this library from waiting for a name server.
#include <nss.h>

namespace KPRV::simulator {

/// Of hosts only the files are asked, from when this library is opened. What is simulated needs no name
/// server, and one that is silent, as on a machine cut off from others, takes ten seconds of each request.
[[gnu::constructor]] static void look_names_up_in_files()
{
    __nss_configure_lookup("hosts", "files");
}

} // namespace KPRV::simulator
