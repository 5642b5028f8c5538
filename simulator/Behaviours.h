#pragma once

#include "simulator/State.h"

#include <json/json.h>

namespace KPRV::simulator {

// The behaviours that Entry_Points.def names. Each answers as Entry_Points.h says; an address that
// the inventory does not have is answered with an "error".

// Life.cpp
Json::Value init_hba_lib(State& state, const Json::Value& request);
Json::Value free_hba_lib(State& state, const Json::Value& request);
Json::Value library_version(State& state, const Json::Value& request);
Json::Value accept(State& state, const Json::Value& request);
Json::Value register_for_events(State& state, const Json::Value& request);
Json::Value unregister_for_events(State& state, const Json::Value& request);
Json::Value next_request_id(State& state, const Json::Value& request);

// Host_Answers.cpp
Json::Value adapter_count(State& state, const Json::Value& request);
Json::Value host_data(State& state, const Json::Value& request);
Json::Value global_info(State& state, const Json::Value& request);

// Adapter_Answers.cpp
Json::Value adapter_addresses(State& state, const Json::Value& request);
Json::Value adapter_id(State& state, const Json::Value& request);
Json::Value adapter_id_by_port(State& state, const Json::Value& request);
Json::Value adapter_data(State& state, const Json::Value& request);
Json::Value flash_info(State& state, const Json::Value& request);
Json::Value set_adapter_state(State& state, const Json::Value& request);

// Port_Answers.cpp
Json::Value fc_port_addresses(State& state, const Json::Value& request);
Json::Value eth_port_addresses(State& state, const Json::Value& request);
Json::Value port_data(State& state, const Json::Value& request);
Json::Value eth_port_data(State& state, const Json::Value& request);
Json::Value set_port(State& state, const Json::Value& request);

// Optics_Answers.cpp
Json::Value optics_identity(State& state, const Json::Value& request);
Json::Value optics_readings(State& state, const Json::Value& request);

// Statistics_Answers.cpp
Json::Value port_counters(State& state, const Json::Value& request);
Json::Value reset_port_counters(State& state, const Json::Value& request);

// Remote_Port_Answers.cpp
Json::Value remote_ports(State& state, const Json::Value& request);
Json::Value remote_port_data(State& state, const Json::Value& request);
Json::Value remote_port_luns(State& state, const Json::Value& request);

/// Marks the rows that nothing answers yet.
Json::Value unsupported(State& state, const Json::Value& request);

} // namespace KPRV::simulator
