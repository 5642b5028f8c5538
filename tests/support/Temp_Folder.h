#pragma once

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include <unistd.h>

namespace KPRV {

/// A folder of a test's own, removed with all that is in it.
class Temp_Folder
{
public:
    Temp_Folder()
    {
        std::string name = (std::filesystem::temp_directory_path() / "kldr_test_XXXXXX").string();
        if (!mkdtemp(name.data()))
            std::abort();
        _path = name;
    }
    ~Temp_Folder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(_path, ignored);
    }
    Temp_Folder(const Temp_Folder&) = delete;
    Temp_Folder& operator=(const Temp_Folder&) = delete;

    std::string path(const char* name = "") const { return (_path / name).string(); }

    /// Writes a file; an executable one can stand in for a program.
    void write(const char* name, const std::string& text, bool executable = false) const
    {
        std::ofstream(_path / name) << text;
        if (executable)
            std::filesystem::permissions(_path / name, std::filesystem::perms::owner_all);
    }
    std::string read(const char* name) const
    {
        std::ifstream file(_path / name);
        return {std::istreambuf_iterator<char>(file), {}};
    }

private:
    std::filesystem::path _path;
};

/// An environment variable, put back at the end of the scope.
class Environment_Override
{
public:
    Environment_Override(const char* name, const std::string& value) : _name(name)
    {
        if (const char* old = getenv(name)) {
            _was_set = true;
            _old = old;
        }
        setenv(name, value.c_str(), 1);
    }
    ~Environment_Override()
    {
        if (_was_set)
            setenv(_name, _old.c_str(), 1);
        else
            unsetenv(_name);
    }
    Environment_Override(const Environment_Override&) = delete;
    Environment_Override& operator=(const Environment_Override&) = delete;

private:
    const char* _name;
    bool _was_set = false;
    std::string _old;
};

} // namespace KPRV
