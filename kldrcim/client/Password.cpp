// Passwords: never an argument, which everybody on the machine can read.
#include "kldrcim/client/Password.h"

#include <cerrno>
#include <cstdio>
#include <fstream>
#include <memory>
#include <sys/stat.h>
#include <system_error>
#include <termios.h>
#include <unistd.h>

namespace KPRV::kldrcim {

namespace {

/// What is typed is not shown, for a scope.
class Silence
{
public:
    explicit Silence(int terminal) : _terminal(terminal), _is_set(tcgetattr(terminal, &_before) == 0)
    {
        termios silent = _before;
        silent.c_lflag &= ~static_cast<tcflag_t>(ECHO);
        if (_is_set)
            tcsetattr(_terminal, TCSAFLUSH, &silent);
    }
    ~Silence()
    {
        if (_is_set)
            tcsetattr(_terminal, TCSAFLUSH, &_before);
    }
    Silence(const Silence&) = delete;
    Silence& operator=(const Silence&) = delete;

private:
    const int _terminal;
    termios _before = {};
    const bool _is_set;
};

} // namespace

std::optional<std::string> password_of_file(const std::string& file, std::string& error)
{
    struct stat status;
    if (stat(file.c_str(), &status) == 0 && S_ISREG(status.st_mode) &&
        (status.st_mode & (S_IRWXG | S_IRWXO))) {
        error = file + ": others may read or change it (chmod 600)";
        return std::nullopt;
    }
    std::ifstream in(file);
    std::string line;
    if (!std::getline(in, line) && line.empty()) {
        error =
            file + ": " + (errno && !in.eof() ? std::generic_category().message(errno) : "no password in it");
        return std::nullopt;
    }
    if (line.ends_with('\r'))
        line.pop_back();
    return line;
}

std::optional<std::string> password_of_terminal(const std::string& prompt, std::string& error)
{
    const std::unique_ptr<std::FILE, int (*)(std::FILE*)> terminal(std::fopen("/dev/tty", "r+"),
                                                                   &std::fclose);
    if (!terminal) {
        error = "no terminal to ask for the password at; --password-file names a file that holds it";
        return std::nullopt;
    }
    std::fputs(prompt.c_str(), terminal.get());
    std::fflush(terminal.get());
    std::string password;
    {
        const Silence silence(fileno(terminal.get()));
        for (int c = std::fgetc(terminal.get()); c != EOF && c != '\n'; c = std::fgetc(terminal.get()))
            password += static_cast<char>(c);
    }
    std::fputs("\n", terminal.get());
    return password;
}

} // namespace KPRV::kldrcim
