#pragma once

#include "simulator/Members.h"

namespace KPRV::simulator {

// What people may write in an inventory, and what stands for what they leave out. Defaults that
// depend on what surrounds the member are filled in by the readers.
// clang-format off

inline constexpr Member host_members[] = {
    {"hostManufacturer",      Type::TEXT,    Presence::NULLABLE, "\"KLDR\""},
    {"hostModel",             Type::TEXT,    Presence::NULLABLE, "\"Simulated host\""},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member library_members[] = {
    {"version",               Type::TEXT,    Presence::NULLABLE},
    {"init",                  Type::ANY,     Presence::OPTIONAL},
};

inline constexpr Member inventory_members[] = {
    {"host",                  Type::OBJECT,  Presence::OPTIONAL, "{}"},
    {"library",               Type::OBJECT,  Presence::OPTIONAL, "{}"},
    {"remotePorts",           Type::ARRAY,   Presence::OPTIONAL, "[]"},
    {"adapters",              Type::ARRAY,   Presence::OPTIONAL, "[]"},
    {"faults",                Type::ARRAY,   Presence::OPTIONAL, "[]"},
    {"answers",               Type::OBJECT,  Presence::OPTIONAL, "{}"},
    {"postedTests",           Type::OBJECT,  Presence::OPTIONAL, "{}"},
    {"events",                Type::ARRAY,   Presence::OPTIONAL, "[]"},
};

inline constexpr Member posted_tests_members[] = {
    {"milliseconds",          Type::COUNT,   Presence::OPTIONAL, "0"},
    {"failing",               Type::ARRAY,   Presence::OPTIONAL, "[]"},
};

inline constexpr Member event_members[] = {
    {"after",                 Type::COUNT,   Presence::OPTIONAL, "0"},
    {"times",                 Type::COUNT,   Presence::OPTIONAL, "1"},
    {"every",                 Type::COUNT,   Presence::OPTIONAL, "0"},
    {"event",                 Type::ANY,     Presence::OPTIONAL},
    {"text",                  Type::TEXT,    Presence::OPTIONAL},
};

inline constexpr Member adapter_members[] = {
    {"address",               Type::ADDRESS, Presence::OPTIONAL},
    {"hbaData",               Type::OBJECT,  Presence::REQUIRED},
    {"driver",                Type::OBJECT,  Presence::NULLABLE, "{}"},
    {"firmware",              Type::OBJECT,  Presence::NULLABLE, "{}"},
    {"flashStatus",           Type::BOOL,    Presence::NULLABLE, "true"},
    {"flashUpdate",           Type::OBJECT,  Presence::OPTIONAL, "{}"},
    {"fcPorts",               Type::ARRAY,   Presence::OPTIONAL, "[]"},
    {"ethPorts",              Type::ARRAY,   Presence::OPTIONAL, "[]"},
    {"answers",               Type::OBJECT,  Presence::OPTIONAL, "{}"},
    {"settings",              Type::OBJECT,  Presence::OPTIONAL},
    {"diagnostics",           Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member hba_data_members[] = {
    {"wwn",                   Type::WWN,     Presence::OPTIONAL},
    {"hbaMAC",                Type::MAC,     Presence::OPTIONAL},
    {"model",                 Type::TEXT,    Presence::NULLABLE},
    {"serialNumber",          Type::TEXT,    Presence::NULLABLE},
    {"portCount",             Type::COUNT,   Presence::NULLABLE},
    {"isCNA",                 Type::BOOL,    Presence::NULLABLE},
    {"hasEthPort",            Type::BOOL,    Presence::NULLABLE},
    {"hbaStatus",             Type::BOOL,    Presence::NULLABLE, "true"},
    {"oem",                   Type::TEXT,    Presence::NULLABLE, "\"\""},
    {"fruNum",                Type::TEXT,    Presence::NULLABLE},
    {"partNum",               Type::TEXT,    Presence::NULLABLE, "\"\""},
    {"oemSerialNum",          Type::TEXT,    Presence::NULLABLE, "\"\""},
    {"uuid",                  Type::TEXT,    Presence::NULLABLE, "\"\""},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member driver_members[] = {
    {"storageDriverName",     Type::TEXT,    Presence::NULLABLE, "\"kldrfc\""},
    {"storageDriverVersion",  Type::TEXT,    Presence::NULLABLE, "\"3.2.1.0\""},
    {"networkDriverName",     Type::TEXT,    Presence::NULLABLE},
    {"networkDriverVersion",  Type::TEXT,    Presence::NULLABLE},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member firmware_members[] = {
    {"version",               Type::TEXT,    Presence::NULLABLE, "\"3.2.1.0\""},
    {"biosVersion",           Type::TEXT,    Presence::NULLABLE, "\"3.2.1.0\""},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member flash_update_members[] = {
    {"status",                Type::COUNT,   Presence::OPTIONAL, "0"},
    {"message",               Type::TEXT,    Presence::OPTIONAL, "\"Flash update successful\""},
};

inline constexpr Member fc_port_members[] = {
    {"wwn",                   Type::WWN,     Presence::REQUIRED},
    {"nodeWwn",               Type::WWN,     Presence::NULLABLE},
    {"fcoeMac",               Type::MAC,     Presence::OPTIONAL},
    {"PortSymbolicName",      Type::TEXT,    Presence::NULLABLE},
    {"operatingSpeed",        Type::COUNT,   Presence::NULLABLE, "8"},
    {"supportedPortSpeeds",   Type::COUNTS,  Presence::NULLABLE, "[8, 4, 2]"},
    {"portTypeMOFValue",      Type::INTEGER, Presence::NULLABLE, "10"},
    {"maxFrameSize",          Type::INTEGER, Presence::NULLABLE, "2112"},
    {"portStatus",            Type::BOOL,    Presence::NULLABLE, "true"},
    {"portStatusValue",       Type::INTEGER, Presence::NULLABLE},
    {"isFCoE",                Type::BOOL,    Presence::NULLABLE},
    {"isMezz",                Type::BOOL,    Presence::NULLABLE, "false"},
    {"beaconState",           Type::BOOL,    Presence::NULLABLE, "false"},
    {"optics",                Type::OBJECT,  Presence::NULLABLE},
    {"statistics",            Type::ARRAY,   Presence::NULLABLE},
    {"remotePorts",           Type::ARRAY,   Presence::OPTIONAL},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
    {"answers",               Type::OBJECT,  Presence::OPTIONAL},
    {"settings",              Type::OBJECT,  Presence::OPTIONAL},
    {"diagnostics",           Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member eth_port_members[] = {
    {"mac",                   Type::MAC,     Presence::REQUIRED},
    {"portStatus",            Type::BOOL,    Presence::NULLABLE, "true"},
    {"portStatusValue",       Type::INTEGER, Presence::NULLABLE},
    {"isMezz",                Type::BOOL,    Presence::NULLABLE, "false"},
    {"beaconState",           Type::BOOL,    Presence::NULLABLE, "false"},
    {"ethData",               Type::OBJECT,  Presence::NULLABLE},
    {"optics",                Type::OBJECT,  Presence::NULLABLE},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
    {"answers",               Type::OBJECT,  Presence::OPTIONAL},
    {"settings",              Type::OBJECT,  Presence::OPTIONAL},
    {"diagnostics",           Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member test_outcome_members[] = {
    {"milliseconds",          Type::COUNT,   Presence::OPTIONAL, "0"},
    {"outcome",               Type::TEXT,    Presence::OPTIONAL, "\"pass\""},
    {"output",                Type::TEXT,    Presence::OPTIONAL},
    {"code",                  Type::INTEGER, Presence::OPTIONAL, "99"},
    {"message",               Type::TEXT,    Presence::OPTIONAL, "\"injected\""},
};

inline constexpr Member frame_counter_members[] = {
    {"transmitFrames",        Type::COUNT,   Presence::OPTIONAL},
    {"GoodFrameRcv",          Type::COUNT,   Presence::OPTIONAL},
    {"outstandingFrames",     Type::COUNT,   Presence::OPTIONAL},
    {"BadFrameNo",            Type::COUNT,   Presence::OPTIONAL},
    {"BadFrameInfo",          Type::COUNT,   Presence::OPTIONAL},
};

inline constexpr Member memory_failure_members[] = {
    {"status",                Type::COUNT,   Presence::OPTIONAL},
    {"address",               Type::COUNT,   Presence::OPTIONAL},
    {"expected value",        Type::COUNT,   Presence::OPTIONAL},
    {"actual value",          Type::COUNT,   Presence::OPTIONAL},
    {"error status",          Type::COUNT,   Presence::OPTIONAL},
    {"error address",         Type::COUNT,   Presence::OPTIONAL},
    {"type",                  Type::TEXT,    Presence::OPTIONAL},
};

inline constexpr Member eth_data_members[] = {
    {"ethDev",                Type::TEXT,    Presence::NULLABLE},
    {"ethPortStateMOFValue",  Type::COUNT,   Presence::NULLABLE},
    {"mtu",                   Type::COUNT,   Presence::NULLABLE, "1500"},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member optics_members[] = {
    {"transceiver",           Type::TEXT,    Presence::NULLABLE},
    {"vendorName",            Type::TEXT,    Presence::NULLABLE, "\"KLDR\""},
    {"vendorPart",            Type::TEXT,    Presence::NULLABLE, "\"KO-SFP\""},
    {"serialNo",              Type::TEXT,    Presence::NULLABLE},
    {"revision",              Type::TEXT,    Presence::NULLABLE, "\"A\""},
    {"speed",                 Type::TEXT,    Presence::NULLABLE},
    {"extendedID",            Type::TEXT,    Presence::NULLABLE, "\"SFP+\""},
    {"readings",              Type::OBJECT,  Presence::NULLABLE},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member optics_reading_members[] = {
    {"temperature",           Type::INTEGER, Presence::NULLABLE, "38"},
    {"voltage",               Type::COUNT,   Presence::NULLABLE, "3290"},
    {"biasCurrent",           Type::COUNT,   Presence::NULLABLE, "6500"},
    {"txPower",               Type::COUNT,   Presence::NULLABLE, "560"},
    {"rxPower",               Type::COUNT,   Presence::NULLABLE, "480"},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member remote_port_members[] = {
    {"remotePortWwn",         Type::WWN,     Presence::REQUIRED},
    {"remoteNodeWwn",         Type::WWN,     Presence::NULLABLE},
    {"deviceData",            Type::OBJECT,  Presence::NULLABLE, "{}"},
    {"lunList",               Type::ARRAY,   Presence::NULLABLE, "[]"},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member device_data_members[] = {
    {"isTarget",              Type::BOOL,    Presence::NULLABLE, "true"},
    {"type",                  Type::TEXT,    Presence::NULLABLE},
    {"stateMofValue",         Type::INTEGER, Presence::NULLABLE, "11"},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

inline constexpr Member lun_members[] = {
    {"number",                Type::COUNT,   Presence::NULLABLE},
    {"vendor",                Type::TEXT,    Presence::NULLABLE, "\"KLDR\""},
    {"productID",             Type::TEXT,    Presence::NULLABLE, "\"Simulated LUN\""},
    {"productSerialNumber",   Type::TEXT,    Presence::NULLABLE},
    {"lunDescription",        Type::TEXT,    Presence::NULLABLE},
    {"lunDescIdType",         Type::COUNT,   Presence::NULLABLE},
    {"extra",                 Type::OBJECT,  Presence::OPTIONAL},
};

// clang-format on

} // namespace KPRV::simulator
