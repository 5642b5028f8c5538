#include "host/Cli.h"
#include "host/Output.h"

int main(int argc, char** argv)
{
    KPRV::host::begin_output();
    return KPRV::host::run_cli({argv + 1, argv + argc});
}
