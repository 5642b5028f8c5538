#include "tests/simulator/Simulator_Fixture.h"

#include <arpa/inet.h>
#include <cerrno>
#include <netdb.h>
#include <resolv.h>
#include <sys/socket.h>
#include <unistd.h>

using namespace KPRV;

namespace {

/// A name server that never answers, which this thread's look-ups go to.
class Silent_Name_Server
{
public:
    Silent_Name_Server()
    {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof address;
        EXPECT_EQ(0, bind(_socket, reinterpret_cast<const sockaddr*>(&address), size));
        EXPECT_EQ(0, getsockname(_socket, reinterpret_cast<sockaddr*>(&address), &size));
        EXPECT_EQ(0, res_init());
        _res.nscount = 1;
        _res.nsaddr_list[0] = address;
        _res.retrans = 1;
        _res.retry = 1;
    }
    ~Silent_Name_Server()
    {
        close(_socket);
        res_init();
    }

    bool was_asked() const
    {
        char query[512];
        return recv(_socket, query, sizeof query, MSG_DONTWAIT) > 0;
    }

private:
    const int _socket = socket(AF_INET, SOCK_DGRAM, 0);
};

struct Host_Names : simulator::Simulator_Fixture
{
};

} // namespace

TEST_F(Host_Names, AreSoughtInFilesAlone)
{
    const Silent_Name_Server server;
    EXPECT_EQ(nullptr, gethostbyname("a-host-that-no-file-knows"));
    EXPECT_FALSE(server.was_asked());
}
