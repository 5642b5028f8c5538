#include "module/update/Firmware_Uri.h"

#include "module/adapter/ProviderUtil.h"
#include "module/runtime/system/log.h"
#include "module/update/Install_Failure.h"

#include <string_view>

namespace KPRV {

namespace {

constexpr uint32 SCHEME_LENGTH = 7;

bool has_scheme(const String& uri, std::string_view scheme)
{
    return std::string_view(uri.c_str(), uri.size()).starts_with(scheme);
}

String from_file(const String& name)
{
    LOG(INFO, "file=%s", name.c_str());
    if (name.empty())
        throw Install_Failure{"malformed file URI"};
    return name;
}

String from_tftp(const String& rest)
{
    const uint32 slash = rest.find('/');
    // A host of one character has always been refused.
    if (slash == NPOS || slash < 2)
        throw Install_Failure{"malformed tftp URI"};
    const String host = rest.substr(0, slash);
    // Remote and local name are the same text.
    String file = rest.substr(slash + 1, NPOS);
    if (file.empty())
        throw Install_Failure{"malformed tftp URI"};
    if (ProviderUtil::TftpGetFile(host.c_str(), file.c_str()) != 0)
        throw Install_Failure{"tftp command failed"};
    return file;
}

} // namespace

String fetch_firmware(const String& uri)
{
    if (has_scheme(uri, "file://"))
        return from_file(uri.substr(SCHEME_LENGTH, NPOS));
    if (has_scheme(uri, "tftp://"))
        return from_tftp(uri.substr(SCHEME_LENGTH, NPOS));
    LOG(ERR, "malformed uri. Throw error");
    throw Install_Failure{"malformed URI"};
}

} // namespace KPRV
