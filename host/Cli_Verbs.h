#pragma once

#include "host/Cli_Options.h"
#include "host/Host.h"

namespace KPRV::host {

/// What a verb does on an open module; gives the exit status.
using Verb_Body = int (*)(const Cli_Options& options, Host& host);

/// One word that `kldrcim` understands.
struct Cli_Verb
{
    const char* name;
    /// How many arguments may follow it.
    std::size_t least;
    std::size_t most;
    /// For the usage line.
    const char* arguments;
    /// Null for the plain operations, which all go one road.
    Verb_Body body;
};

/// Null for a word that is no verb.
const Cli_Verb* find_verb(const std::string& name);

} // namespace KPRV::host
