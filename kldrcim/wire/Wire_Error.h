#pragma once

#include "broker/values/Plain_Value.h"

#include <stdexcept>

namespace KPRV::kldrcim {

using namespace broker;

/// What a reader of CIM in XML throws at something that it cannot take.
class Wire_Error : public std::runtime_error
{
public:
    /// Well-formed elements that no message may have: something is missing, or there twice.
    static Wire_Error not_valid(const std::string& text) { return {CMPI_RC_OK, text}; }
    /// A message that is right by its form, and whose operation fails with this status.
    static Wire_Error status(CMPIrc rc, const std::string& text) { return {rc, text}; }

    bool is_not_valid() const { return _rc == CMPI_RC_OK; }
    CMPIrc rc() const { return _rc; }

private:
    Wire_Error(CMPIrc rc, const std::string& text) : std::runtime_error(text), _rc(rc) {}

    CMPIrc _rc;
};

} // namespace KPRV::kldrcim
