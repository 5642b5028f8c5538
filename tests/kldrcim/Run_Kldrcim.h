#pragma once

#include <cstdio>
#include <cstdlib>
#include <string>
#include <sys/wait.h>

namespace KPRV::kldrcim {

/// The program as users run it: its exit status and what it wrote.
struct Outcome
{
    int status;
    std::string out;
    std::string error;
};

inline std::string read_file(const char* name)
{
    std::string text;
    if (std::FILE* file = std::fopen(name, "r")) {
        char buffer[4096];
        while (std::size_t size = std::fread(buffer, 1, sizeof buffer, file))
            text.append(buffer, size);
        std::fclose(file);
    }
    return text;
}

/// `arguments` as a shell reads them, `environment` as assignments before the command. The toy that passes
/// for the product's own module has its name space, too.
inline Outcome kldrcim(const std::string& arguments, const char* library = TOY_DESCRIBED,
                       const char* environment = "")
{
    std::string command = std::string(environment) + " " + KLDRCIM + " --module " + library +
                          " --namespace " +
                          (std::string(library) == TOY_FABRIC ? "root/kaldera" : "root/toy") + " " +
                          arguments + " >cli_test.out 2>cli_test.err";
    int status = std::system(command.c_str());
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, read_file("cli_test.out"),
            read_file("cli_test.err")};
}

/// What is said first of a module that passes for the product's own.
inline constexpr const char* no_library =
    "kldrcim: warning: the adapter library libdzntj.so is not loaded; no adapters will be seen\n";

/// Over the small host with adapters.
inline Outcome on_fabric(const std::string& arguments, const char* environment = "LC_ALL=C.UTF-8")
{
    return kldrcim(arguments, TOY_FABRIC, environment);
}

} // namespace KPRV::kldrcim
