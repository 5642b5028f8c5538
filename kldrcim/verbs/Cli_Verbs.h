#pragma once

#include "kldrcim/connection/Connection.h"
#include "kldrcim/input/Cli_Options.h"

#include <span>

namespace KPRV::kldrcim {

using namespace broker;

/// What a verb does on an open module; gives the exit status.
using Verb_Body = int (*)(const Cli_Options& options, Connection& connection);

/// One word that `kldrcim` understands.
struct Cli_Verb
{
    const char* name;
    /// How many arguments may follow it.
    std::size_t least;
    std::size_t most;
    /// What they are, a line for each form that the verb has.
    const char* arguments;
    /// Null for the one that asks nobody and is asked itself.
    Verb_Body body;
    /// The operation that the plain verbs stand for; the others do not look at it.
    Operation operation;
    /// The values of --format that it knows, and its options beside those that all verbs have.
    const char* formats;
    const char* options;
    /// What it does, a line for each form.
    const char* summary;
    /// What its exit statuses mean where that is not what they always mean; null for nothing.
    const char* statuses;
    /// Exit status where there is no module to ask.
    int without_module = 2;
    /// What it does where nobody is asked; then there is no other body.
    int (*body_alone)(const Cli_Options& options) = nullptr;
};

std::span<const Cli_Verb> cli_verbs();

/// True for an option that the verb has beside those that all have. Of two options of one name, the one with
/// a value stands as
/// "--name=" in the verb's row.
bool takes_option(const Cli_Verb& verb, const Cli_Option& option);

/// Null for a word that is no verb.
const Cli_Verb* find_verb(const std::string& name);

} // namespace KPRV::kldrcim
