#pragma once

#include <algorithm>
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
    /// In bytes; 0 if there is no such file.
    std::size_t size(const char* name) const
    {
        std::error_code ignored;
        const std::uintmax_t size = std::filesystem::file_size(_path / name, ignored);
        return ignored ? 0 : size;
    }
    /// What a file holds behind its first bytes.
    std::string read(const char* name, std::size_t from = 0) const
    {
        std::string text(std::max(size(name), from) - from, '\0');
        std::ifstream file(_path / name);
        file.seekg(static_cast<std::streamoff>(from));
        file.read(text.data(), static_cast<std::streamsize>(text.size()));
        text.resize(file.gcount());
        return text;
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
