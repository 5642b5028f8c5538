#include "kldrcim/input/Text_File.h"

#include <cerrno>
#include <cstdio>
#include <memory>
#include <system_error>

namespace KPRV::kldrcim {

std::optional<std::string> read_text_file(const std::string& name, std::string& error)
{
    struct Close
    {
        void operator()(std::FILE* file) const
        {
            if (file != stdin)
                std::fclose(file);
        }
    };
    const std::unique_ptr<std::FILE, Close> file(name == "-" ? stdin : std::fopen(name.c_str(), "r"));
    std::string text;
    char buffer[4096];
    while (file)
        if (const std::size_t size = std::fread(buffer, 1, sizeof buffer, file.get()))
            text.append(buffer, size);
        else
            break;
    if (file && !std::ferror(file.get()))
        return text;
    error = std::generic_category().message(errno);
    return std::nullopt;
}

} // namespace KPRV::kldrcim
