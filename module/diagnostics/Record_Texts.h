#pragma once

#include "module/adapter/ProviderUtil.h"

namespace KPRV::record_text {

// What the runs say, by the numbers of `ProviderUtil::getRecordData`.

inline constexpr diag_record_msg_t CHECKING_ADAPTER{1};
inline constexpr diag_record_msg_t ADAPTER_NOT_DISABLED{2};
inline constexpr diag_record_msg_t DISABLING_ADAPTER{3};
inline constexpr diag_record_msg_t ENABLING_ADAPTER{4};
inline constexpr diag_record_msg_t RUNNING_MEMORY{5};
inline constexpr diag_record_msg_t CHECKING_MEMORY_RESULT{6};
inline constexpr diag_record_msg_t MEMORY_PASSED{7};
inline constexpr diag_record_msg_t MEMORY_FAILED{8};
inline constexpr diag_record_msg_t RUNNING_PCI{9};
inline constexpr diag_record_msg_t CHECKING_PCI_RESULT{10};
inline constexpr diag_record_msg_t PCI_PASSED{11};
inline constexpr diag_record_msg_t PCI_FAILED{12};
inline constexpr diag_record_msg_t CHECKING_PORT{13};
inline constexpr diag_record_msg_t PORT_ALREADY_DISABLED{14};
inline constexpr diag_record_msg_t PORT_NOT_DISABLED{15};
inline constexpr diag_record_msg_t RUNNING_LOOPBACK{18};
inline constexpr diag_record_msg_t CHECKING_LOOPBACK_RESULT{19};
inline constexpr diag_record_msg_t LOOPBACK_PASSED{20};
inline constexpr diag_record_msg_t LOOPBACK_FAILED{21};
inline constexpr diag_record_msg_t CHECKING_PORT_FOR_ETH{22};
inline constexpr diag_record_msg_t RUNNING_ETH_LOOPBACK{25};
inline constexpr diag_record_msg_t CHECKING_ETH_RESULT{26};
inline constexpr diag_record_msg_t ETH_LOOPBACK_PASSED{27};
inline constexpr diag_record_msg_t ETH_LOOPBACK_FAILED{28};
inline constexpr diag_record_msg_t DISABLING_PORT{29};
inline constexpr diag_record_msg_t ENABLING_PORT{30};
inline constexpr diag_record_msg_t DISABLING_FAILED{31};
inline constexpr diag_record_msg_t MEMORY_TAKES_LONG{32};
inline constexpr diag_record_msg_t ADAPTER_ALREADY_DISABLED{33};

} // namespace KPRV::record_text
