#pragma once

#include "kldrcim/connection/Connection.h"

namespace KPRV::kldrcim {

using namespace broker;

/// What the transceiver of a port measures, in base units; nothing where it does not.
struct Optics_Readings
{
    std::optional<double> celsius;
    std::optional<double> volts;
    std::optional<double> amperes;
    std::optional<double> transmit_watts;
    std::optional<double> receive_watts;
};

/// Asks the agent, since no class of the model has readings. Once it refuses the call itself, as a server
/// does whose user may not call methods, it is asked no more.
class Optics_Reader
{
public:
    explicit Optics_Reader(Connection& connection) : _connection(connection) {}

    /// Of an FC port, by its address in colon form. Without any reading for an empty slot, or optics that are
    /// not monitored.
    Optics_Readings read(const std::string& port);

private:
    Connection& _connection;
    bool _is_refused = false;
};

} // namespace KPRV::kldrcim
