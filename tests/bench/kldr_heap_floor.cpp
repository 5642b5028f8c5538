#include "tests/bench/Floor_Row.h"
#include "tests/bench/Heap_Peak.h"
#include "tests/bench/Home_Folder.h"

#include <cstdio>
#include <string_view>

using namespace KPRV::bench;

static size_t peak_of(const Floor_Row::Maker& maker)
{
    Lean_Broker::get().begin_call();
    const Floor_Row::Request request = maker(Lean_Broker::get());
    begin_heap_peak();
    request();
    return heap_peak();
}

/// kldr_heap_floor [--tiny]: a line for each row, its name and the peak in bytes of the request and of its
/// floor.
int main(int argc, char** argv)
{
    const Home_Folder home("LOG_LEVEL=ERR\n");
    serve_instances();
    for (const Floor_Row& row : heap_rows(argc > 1 && std::string_view(argv[1]) == "--tiny")) {
        row.prepare();
        const Floor_Row::Maker floor = floor_of(row);
        printf("%s\t%zu\t%zu\n", row.name.c_str(), peak_of(row.ours), peak_of(floor));
    }
    return 0;
}
