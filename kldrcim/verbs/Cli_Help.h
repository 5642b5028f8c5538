#pragma once

#include "kldrcim/verbs/Cli_Verbs.h"

namespace KPRV::kldrcim {

/// The text of `--help`: every verb and every option.
std::string program_help();

/// What there is to know of one verb.
std::string verb_help(const Cli_Verb& verb);

/// "usage: kldrcim [options] VERB ...", one line.
std::string usage_line(const Cli_Verb& verb);

} // namespace KPRV::kldrcim
