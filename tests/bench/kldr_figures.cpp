#include "tests/bench/Figures.h"
#include "tests/bench/Home_Folder.h"
#include "tests/bench/Lean_Broker.h"

#include <cstdio>
#include <cstring>

using namespace KPRV::bench;

/// kldr_figures [--tiny]: what has no rival, as lines "name <tab> value <tab> unit".
int main(int argc, char** argv)
{
    const char* const mode = argc > 1 ? argv[1] : "";
    const bool tiny = strcmp(mode, "--tiny") == 0;
    if (strcmp(mode, "--first-answer") == 0) {
        print_first_answer();
        return 0;
    }
    {
        const Home_Folder home(nullptr);
        print_log_figure("B5 silent line, no log configured", tiny);
    }
    const Home_Folder home("LOG_LEVEL=ERR\n");
    print_log_figure("B5 silent line, level ERR", tiny);
    print_load_figures(argv[0], tiny);
    print_growth_figures(tiny);
    print_event_figures(tiny);
    return 0;
}
