#pragma once

#include "simulator/Settings.h"
#include "simulator/State.h"
#include "simulator/Statistics_Kinds.h"

#include <json/json.h>

namespace KPRV::simulator {

// The behaviours that Behaviours.def names. Each answers as Entry_Points.h says; an address that
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
Json::Value server_time(State& state, const Json::Value& request);
Json::Value driver_log(State& state, const Json::Value& request);

// Adapter_Answers.cpp
Json::Value adapter_addresses(State& state, const Json::Value& request);
Json::Value adapter_id(State& state, const Json::Value& request);
Json::Value adapter_id_by_port(State& state, const Json::Value& request);
Json::Value adapter_data(State& state, const Json::Value& request);
Json::Value flash_info(State& state, const Json::Value& request);
Json::Value set_adapter_state(State& state, const Json::Value& request);

// Flash_Answers.cpp
Json::Value update_flash(State& state, const Json::Value& request);

// Port_Answers.cpp
Json::Value fc_port_addresses(State& state, const Json::Value& request);
Json::Value eth_port_addresses(State& state, const Json::Value& request);
Json::Value port_data(State& state, const Json::Value& request);
Json::Value eth_port_data(State& state, const Json::Value& request);
Json::Value set_port(State& state, const Json::Value& request);
Json::Value set_eth_port(State& state, const Json::Value& request);
Json::Value clear_logs(State& state, const Json::Value& request);

// Optics_Answers.cpp
Json::Value optics_identity(State& state, const Json::Value& request);
Json::Value optics_readings(State& state, const Json::Value& request);

// Statistics_Answers.cpp
Json::Value port_counters(State& state, const Json::Value& request);
Json::Value reset_port_counters(State& state, const Json::Value& request);
Json::Value statistics_answer(State& state, const Json::Value& request, Statistics kind);
Json::Value reset_statistics_answer(State& state, const Json::Value& request, Statistics kind);

template <Statistics kind>
Json::Value statistics(State& state, const Json::Value& request)
{
    return statistics_answer(state, request, kind);
}

template <Statistics kind>
Json::Value reset_statistics(State& state, const Json::Value& request)
{
    return reset_statistics_answer(state, request, kind);
}

// Remote_Port_Answers.cpp
Json::Value remote_ports(State& state, const Json::Value& request);
Json::Value remote_port_data(State& state, const Json::Value& request);
Json::Value remote_port_luns(State& state, const Json::Value& request);

// Setting_Answers.cpp
Json::Value setting_answer(State& state, const Json::Value& request, Setting setting);

template <Setting which>
Json::Value setting(State& state, const Json::Value& request)
{
    return setting_answer(state, request, which);
}

Json::Value set_fc(State& state, const Json::Value& request);
Json::Value set_fcoe(State& state, const Json::Value& request);
Json::Value set_authentication(State& state, const Json::Value& request);
Json::Value reset_authentication(State& state, const Json::Value& request);
Json::Value set_adapter_mode(State& state, const Json::Value& request);
Json::Value set_trunking(State& state, const Json::Value& request);
Json::Value set_adapter_alias(State& state, const Json::Value& request);
Json::Value set_port_alias(State& state, const Json::Value& request);

// Virtual_Port_Answers.cpp
Json::Value virtual_ports(State& state, const Json::Value& request);
Json::Value virtual_port_data(State& state, const Json::Value& request);
Json::Value create_virtual_port(State& state, const Json::Value& request);
Json::Value delete_virtual_ports(State& state, const Json::Value& request);

// Virtual_Nic_Answers.cpp
Json::Value pci_function_data(State& state, const Json::Value& request);
Json::Value eth_functions(State& state, const Json::Value& request);
Json::Value create_vnic(State& state, const Json::Value& request);
Json::Value delete_vnics(State& state, const Json::Value& request);
Json::Value modify_vnics(State& state, const Json::Value& request);

// Hardware_Tests.cpp
Json::Value memory_test(State& state, const Json::Value& request);
Json::Value pci_loopback_test(State& state, const Json::Value& request);
Json::Value loopback_test(State& state, const Json::Value& request);
Json::Value eth_loopback_test(State& state, const Json::Value& request);

// Path_Record_Answers.cpp
Json::Value lun_masks(State& state, const Json::Value& request);
Json::Value set_lun_masks(State& state, const Json::Value& request);
Json::Value io_profiles(State& state, const Json::Value& request);
Json::Value set_io_profiles(State& state, const Json::Value& request);
Json::Value clear_io_profiles(State& state, const Json::Value& request);
Json::Value reset_io_data(State& state, const Json::Value& request);

// Posted_Test_Answers.cpp
Json::Value post_test(State& state, const Json::Value& request);
Json::Value start_tests(State& state, const Json::Value& request);
Json::Value cancel_tests(State& state, const Json::Value& request);
Json::Value test_results(State& state, const Json::Value& request);
Json::Value set_dport(State& state, const Json::Value& request);
Json::Value dport_result(State& state, const Json::Value& request);

/// Marks the rows that nothing answers yet.
Json::Value unsupported(State& state, const Json::Value& request);

} // namespace KPRV::simulator
