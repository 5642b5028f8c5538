#pragma once

namespace KPRV {

/// The host's name for one walk over adapters or ports: the resolver, which reads files and may ask the
/// network, is asked once, and what it said is repeated from then on, line for line in the log. A host does
/// not change its name between two ports of one answer.
class Host_Name
{
public:
    /// As `ProviderUtil::getHostInfo`.
    int get(char* buffer, int length);

private:
    int _length = 0;
    int _code = 0;
    const char* _said = nullptr;
    char _text[256] = {};
};

} // namespace KPRV
