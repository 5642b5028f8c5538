#include "host/Cli.h"

int main(int argc, char** argv)
{
    return KPRV::host::run_cli({argv + 1, argv + argc});
}
