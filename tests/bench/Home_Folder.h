#pragma once

#include <string>

namespace KPRV::bench {

/// A home directory of the process's own, with a log configuration in it if there is a text. It goes with the
/// object.
class Home_Folder
{
public:
    explicit Home_Folder(const char* log_configuration);
    ~Home_Folder();
    Home_Folder(const Home_Folder&) = delete;
    Home_Folder& operator=(const Home_Folder&) = delete;

private:
    std::string _path;
};

} // namespace KPRV::bench
