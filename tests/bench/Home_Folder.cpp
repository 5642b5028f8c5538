#include "tests/bench/Home_Folder.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>

namespace KPRV::bench {

Home_Folder::Home_Folder(const char* log_configuration)
{
    char path[] = "/tmp/kldr_bench.XXXXXX";
    if (!mkdtemp(path)) {
        perror("bench: mkdtemp");
        exit(1);
    }
    _path = path;
    setenv("HOME", path, 1);
    if (log_configuration) {
        FILE* const file = fopen((_path + "/.cimplerc").c_str(), "w");
        fputs(log_configuration, file);
        fclose(file);
    }
}

Home_Folder::~Home_Folder()
{
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
}

} // namespace KPRV::bench
