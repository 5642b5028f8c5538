#pragma once

#include <map>
#include <string>

namespace KPRV::kldrcim {

/// Who may come in: lines `user:hash`, the hash as in a shadow file (crypt), `#` before remarks.
class Users_File
{
public:
    /// False with `error` if the file cannot be read, is open to others, or has a line that is none.
    bool read(const std::string& file, std::string& error);

    /// Takes as long for a user that there is not as for a wrong password.
    bool accepts(const std::string& user, const std::string& password) const;

private:
    std::map<std::string, std::string> _hashes;
};

} // namespace KPRV::kldrcim
