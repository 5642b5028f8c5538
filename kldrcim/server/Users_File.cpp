#include "kldrcim/server/Users_File.h"

#include <cerrno>
#include <crypt.h>
#include <cstring>
#include <fstream>
#include <memory>
#include <sys/stat.h>
#include <system_error>

namespace KPRV::kldrcim {

bool Users_File::read(const std::string& file, std::string& error)
{
    struct stat status;
    std::ifstream in(file);
    if (!in || stat(file.c_str(), &status) != 0) {
        error = file + ": " + std::generic_category().message(errno);
        return false;
    }
    if ((status.st_mode & (S_IROTH | S_IWOTH | S_IWGRP)) != 0) {
        error = file + ": others may read or change it (chmod 600)";
        return false;
    }
    std::string line;
    for (unsigned number = 1; std::getline(in, line); ++number) {
        if (line.empty() || line[0] == '#')
            continue;
        const std::size_t colon = line.find(':');
        // What does not begin with a method is no hash, but perhaps a password.
        if (colon == 0 || colon == std::string::npos || line.size() <= colon + 1 || line[colon + 1] != '$') {
            error = file + ":" + std::to_string(number) + ": no \"user:hash\" with a hash of crypt ($6$...)";
            return false;
        }
        _hashes[line.substr(0, colon)] = line.substr(colon + 1);
    }
    if (_hashes.empty()) {
        error = file + ": no user";
        return false;
    }
    return true;
}

bool Users_File::accepts(const std::string& user, const std::string& password) const
{
    const auto found = _hashes.find(user);
    const std::string& hash = found == _hashes.end() ? _hashes.begin()->second : found->second;
    const auto data = std::make_unique<crypt_data>();
    const char* computed = crypt_r(password.c_str(), hash.c_str(), data.get());
    if (!computed)
        return false;
    unsigned difference = std::strlen(computed) == hash.size() ? 0 : 1;
    for (std::size_t i = 0; i < hash.size() && computed[i] != '\0'; ++i)
        difference |= static_cast<unsigned char>(computed[i]) ^ static_cast<unsigned char>(hash[i]);
    return difference == 0 && found != _hashes.end();
}

} // namespace KPRV::kldrcim
