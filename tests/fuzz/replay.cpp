// Runs a fuzz target over the files of a folder, where there is no fuzzer: each was an input that once
// mattered.
#include "tests/fuzz/Fuzz_Target.h"

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <vector>

int main(int argc, char** argv)
{
    unsigned count = 0;
    for (int i = 1; i < argc; ++i)
        for (const auto& entry : std::filesystem::directory_iterator(argv[i])) {
            std::ifstream file(entry.path(), std::ios::binary);
            const std::vector<char> bytes((std::istreambuf_iterator<char>(file)), {});
            std::printf("%s\n", entry.path().filename().c_str());
            std::fflush(stdout);
            LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size());
            ++count;
        }
    std::printf("%u inputs\n", count);
    return count ? 0 : 1;
}
