// Of `ProviderUtil`, the name and the address of the machine, from the C library's resolver.
#include "module/adapter/Host_Calls.h"
#include "module/adapter/Host_Name.h"
#include "module/adapter/ProviderUtil.h"
#include "module/adapter/ProviderUtil_Log.h"
#include "module/runtime/dispatch/Request_Scope.h"

#include <arpa/inet.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <memory>
#include <new>

namespace KPRV {

namespace {

constexpr size_t NAME_SIZE = 255;

/// A text of the caller's, cut to its room.
struct Out_Text
{
    char* data;
    size_t size;

    void set(const char* text) const
    {
        if (size > 0)
            data[0] = '\0';
        append(text);
    }
    void append(const char* text) const
    {
        const size_t used = strnlen(data, size);
        if (used + 1 < size)
            strncat(data, text, size - used - 1);
    }
};

/// Asks for a name; false if there is none. The C library may leave a cut name unterminated.
bool ask_name(int (*call)(char*, size_t), char (&name)[NAME_SIZE])
{
    if (call(name, sizeof name) != 0)
        return false;
    name[sizeof name - 1] = '\0';
    return true;
}

enum class Lookup
{
    NONE,
    LOOPBACK_ONLY,
    FOUND
};

/// The resolver's answer in room of its own, so that no thread waits for another's name server.
class Host_Entry
{
public:
    explicit Host_Entry(const char* host)
    {
        constexpr size_t MOST = size_t(1) << 20;
        size_t size = sizeof _usual;
        bool wants_more = !ask(host, _usual, size);
        while (wants_more && size < MOST) {
            size *= 4;
            _more.reset(new (std::nothrow) char[size]);
            if (!_more)
                return;
            wants_more = !ask(host, _more.get(), size);
        }
    }
    /// Null if there is none.
    const hostent* entry() const { return _entry; }

private:
    /// False if the answer needs more room.
    bool ask(const char* host, char* room, size_t size)
    {
        int error = 0;
        const int status = host_calls.gethostbyname_r(host, &_record, room, size, &_entry, &error);
        if (status != 0)
            _entry = nullptr;
        return status != ERANGE;
    }

    hostent _record;
    hostent* _entry = nullptr;
    char _usual[1024];
    std::unique_ptr<char[]> _more;
};

/// What the system says of the host.
struct Host_Facts : Request_Scope::Note
{
    Host_Facts()
    {
        named = ask_name(host_calls.gethostname, host);
        if (!named)
            return;
        look_up();
        if (lookup != Lookup::LOOPBACK_ONLY)
            return;
        still_named = ask_name(host_calls.gethostname, host);
        in_domain = still_named && ask_name(host_calls.getdomainname, domain);
    }

    bool named = false;
    char host[NAME_SIZE] = {};
    Lookup lookup = Lookup::NONE;
    char address[INET_ADDRSTRLEN] = {}; ///< The first one that is no loopback address.
    // Only where there are loopback addresses and no others. Either way (constant): nobody looks at them
    // elsewhere.
    bool still_named = false;
    bool in_domain = false;
    char domain[NAME_SIZE] = {};

private:
    void look_up()
    {
        const Host_Entry answer(host);
        const hostent* const entry = answer.entry();
        if (!entry || !entry->h_addr_list || !entry->h_addr_list[0])
            return;
        lookup = Lookup::LOOPBACK_ONLY;
        for (char** next = entry->h_addr_list; *next && lookup != Lookup::FOUND; next++) {
            inet_ntop(AF_INET, *next, address, sizeof address);
            if (strncmp(address, "127", 3) != 0)
                lookup = Lookup::FOUND;
        }
    }
};

/// The code of `getHostInfo`, and what its caller is to tell the log; null for nothing.
struct Outcome
{
    int code;
    const char* said;
};

Outcome tell_host(const Host_Facts& facts, Out_Text out)
{
    constexpr Outcome by_name = {
        2, "gethostbyname() FAILED. hostString will have hostname instead of ipAddress"};
    if (!facts.named) {
        out.set("localhost");
        return {3, "gethostname() FAILED. hostString will be filled with localhost"};
    }
    switch (facts.lookup) {
    case Lookup::NONE:
        out.set(facts.host);
        return by_name;
    case Lookup::FOUND:
        out.set(facts.address);
        return {0, nullptr};
    case Lookup::LOOPBACK_ONLY:
        break;
    }

    if (!facts.still_named)
        return {2, "gethostname() failed"};
    out.set(facts.host);
    if (!facts.in_domain)
        return {2, "getdomainname() failed"};
    // The name with its domain is tested and then dropped: callers have always seen the bare name. The test
    // can only hold where the buffer had no room for the domain.
    out.append(".");
    out.append(facts.domain);
    if (strncmp(out.data, "localhost", out.size) == 0 && strcmp(facts.domain, "(none)") == 0)
        return {4, nullptr};
    out.set(facts.host);
    return by_name;
}

/// Within a request the system is asked once: the resolver reads files and may ask the network.
Outcome ask_for_host(Out_Text out)
{
    Request_Scope* const request = Request_Scope::current();
    if (!request)
        return tell_host(Host_Facts(), out);
    if (!request->host)
        request->host = std::make_unique<Host_Facts>();
    return tell_host(static_cast<const Host_Facts&>(*request->host), out);
}

void tell(const char* said)
{
    if (said)
        UTIL_LOG(INFO, "%s", said);
}

Out_Text room(char* buffer, int length)
{
    return {buffer, length > 0 ? static_cast<size_t>(length) : 0};
}

constexpr const char* SCOPE = "getHostInfo";

} // namespace

int ProviderUtil::getHostInfo(char* buffer, int length)
{
    UTIL_SCOPE(SCOPE);
    const Outcome outcome = ask_for_host(room(buffer, length));
    tell(outcome.said);
    return outcome.code;
}

const String& Host_Name::get()
{
    UTIL_SCOPE(SCOPE);
    if (!_asked) {
        char text[256] = {};
        _said = ask_for_host(room(text, std::min(_room, int(sizeof text)))).said;
        _text = text;
        _asked = true;
    }
    tell(_said);
    return _text;
}

String ProviderUtil::getHostName()
{
    UTIL_SCOPE("getHostName");
    utsname name = {};
    const int status = host_calls.uname(&name);
    if (status < 0) {
        UTIL_LOG(ERR, "uname() returned error = %d", status);
        return "localhost";
    }
    return name.nodename;
}

String ProviderUtil::updateNamespacePath(const String& path)
{
    UTIL_SCOPE("updateNamespacePath");
    char host[NAME_SIZE] = {};
    getHostInfo(host, sizeof host);
    String full("//", host, "/root/kaldera:");
    full.append(path);
    return full;
}

} // namespace KPRV
