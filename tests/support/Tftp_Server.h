#pragma once

#include "tests/support/Eventually.h"
#include "tests/support/Temp_Folder.h"

#include <arpa/inet.h>
#include <fcntl.h>
#include <net/if.h>
#include <sched.h>
#include <signal.h>
#include <spawn.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <string>

namespace KPRV {

/// A real tftp server over a folder of its own, at the address 127.0.0.1 for a scope. Where that is allowed,
/// the calling thread gets a network of its own, with nothing but a loopback in it, so that neither other
/// tests nor a server of the machine are in the way. Where there can be none, `problem` says why.
class Tftp_Server
{
public:
    Tftp_Server()
    {
        if (geteuid() != 0)
            _problem = "in.tftpd serves port 69 for root only";
        else if (!std::filesystem::exists(PROGRAM))
            _problem = std::string(PROGRAM) + " (package tftpd-hpa) is not installed";
        else if (!std::filesystem::exists("/usr/bin/tftp"))
            _problem = "/usr/bin/tftp (package tftp-hpa) is not installed";
        else
            start();
    }
    ~Tftp_Server()
    {
        if (_server > 0) {
            kill(_server, SIGTERM);
            waitpid(_server, nullptr, 0);
        }
        if (_network_before >= 0) {
            setns(_network_before, CLONE_NEWNET);
            close(_network_before);
        }
    }
    Tftp_Server(const Tftp_Server&) = delete;
    Tftp_Server& operator=(const Tftp_Server&) = delete;

    /// Empty if the server runs.
    const std::string& problem() const { return _problem; }
    /// What clients can fetch.
    const Temp_Folder& files() const { return _files; }

private:
    static constexpr const char* PROGRAM = "/usr/sbin/in.tftpd";

    void start()
    {
        isolate_network();
        // The server reads as a user without rights.
        std::filesystem::permissions(_files.path(), std::filesystem::perms(0755));
        const std::string folder = _files.path();
        // A network of one's own has no address that the resolver would count: there the server takes all.
        const char* const address = _network_before >= 0 ? ":69" : "127.0.0.1:69";
        const char* const words[] = {PROGRAM, "--foreground", "--ipv4",       "--address",
                                     address, "--secure",     folder.c_str(), nullptr};
        if (posix_spawn(&_server, PROGRAM, nullptr, nullptr, const_cast<char* const*>(words), environ) != 0) {
            _server = 0;
            _problem = std::string(PROGRAM) + " cannot be run";
            return;
        }
        // It serves, or it ends.
        eventually([&] {
            if (waitpid(_server, nullptr, WNOHANG) == _server)
                _server = 0;
            return !_server || port_is_taken();
        });
        if (!_server || !port_is_taken())
            _problem = std::string(PROGRAM) + " cannot serve 127.0.0.1:69 here";
    }

    void isolate_network()
    {
        const int before = open("/proc/self/ns/net", O_RDONLY | O_CLOEXEC);
        if (unshare(CLONE_NEWNET) != 0) {
            close(before);
            return;
        }
        _network_before = before;
        const int any = socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0);
        ifreq loopback = {};
        strcpy(loopback.ifr_name, "lo");
        loopback.ifr_flags = IFF_UP;
        ioctl(any, SIOCSIFFLAGS, &loopback);
        close(any);
    }

    static bool port_is_taken()
    {
        const int probe = socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0);
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_port = htons(69);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        const bool taken = bind(probe, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0;
        close(probe);
        return taken;
    }

    Temp_Folder _files;
    std::string _problem;
    pid_t _server = 0;
    int _network_before = -1;
};

} // namespace KPRV
