// The program: `main`, and nothing that a test would want to call.
#include "kldrcim/Cli.h"
#include "kldrcim/formats/Output.h"

int main(int argc, char** argv)
{
    KPRV::kldrcim::begin_output();
    return KPRV::kldrcim::run_cli({argv + 1, argv + argc});
}
