#pragma once

#include "module/runtime/ground/String.h"

namespace KPRV {

/// The host's name for one walk over adapters or ports: the resolver, which reads files and may ask the
/// network, is asked once, and what it said is repeated from then on, line for line in the log. A host does
/// not change its name between two ports of one answer.
class Host_Name
{
public:
    /// The name is cut to what fits into `room` characters with its terminator; at most 256.
    explicit Host_Name(int room) : _room(room) {}

    /// The text of `ProviderUtil::getHostInfo`, which all instances of the walk share.
    const String& get();

private:
    const int _room;
    bool _asked = false;
    const char* _said = nullptr;
    String _text;
};

} // namespace KPRV
