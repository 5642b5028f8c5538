#include "kldrcim/formats/Output.h"
#include "kldrcim/verbs/Cli.h"

int main(int argc, char** argv)
{
    KPRV::broker::begin_output();
    return KPRV::broker::run_cli({argv + 1, argv + argc});
}
