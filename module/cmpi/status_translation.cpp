#include "module/cmpi/status_translation.h"

namespace KPRV {

namespace {

struct Status_Row
{
    Status_Family family;
    int status;
    CMPIrc rc;
};

} // namespace

// clang-format off
static constexpr Status_Row status_rows[] = {
    {Status_Family::GET_INSTANCE,          GET_INSTANCE_NOT_FOUND,              CMPI_RC_ERR_NOT_FOUND},
    // The handle's fallback absorbs "unsupported"; where it shows up all the same, something failed.
    {Status_Family::GET_INSTANCE,          GET_INSTANCE_UNSUPPORTED,            CMPI_RC_ERR_FAILED},
    {Status_Family::GET_INSTANCE,          GET_INSTANCE_INVALID_PARAMETER,      CMPI_RC_ERR_INVALID_PARAMETER},
    {Status_Family::GET_INSTANCE,          GET_INSTANCE_ACCESS_DENIED,          CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::GET_INSTANCE,          GET_INSTANCE_FAILED,                 CMPI_RC_ERR_FAILED},
    {Status_Family::CREATE_INSTANCE,       CREATE_INSTANCE_ALREADY_EXISTS,      CMPI_RC_ERR_ALREADY_EXISTS},
    {Status_Family::CREATE_INSTANCE,       CREATE_INSTANCE_UNSUPPORTED,         CMPI_RC_ERR_NOT_SUPPORTED},
    {Status_Family::CREATE_INSTANCE,       CREATE_INSTANCE_INVALID_PARAMETER,   CMPI_RC_ERR_INVALID_PARAMETER},
    {Status_Family::CREATE_INSTANCE,       CREATE_INSTANCE_ACCESS_DENIED,       CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::CREATE_INSTANCE,       CREATE_INSTANCE_FAILED,              CMPI_RC_ERR_FAILED},
    {Status_Family::MODIFY_INSTANCE,       MODIFY_INSTANCE_NOT_FOUND,           CMPI_RC_ERR_NOT_FOUND},
    {Status_Family::MODIFY_INSTANCE,       MODIFY_INSTANCE_UNSUPPORTED,         CMPI_RC_ERR_NOT_SUPPORTED},
    {Status_Family::MODIFY_INSTANCE,       MODIFY_INSTANCE_INVALID_PARAMETER,   CMPI_RC_ERR_INVALID_PARAMETER},
    {Status_Family::MODIFY_INSTANCE,       MODIFY_INSTANCE_ACCESS_DENIED,       CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::MODIFY_INSTANCE,       MODIFY_INSTANCE_FAILED,              CMPI_RC_ERR_FAILED},
    {Status_Family::DELETE_INSTANCE,       DELETE_INSTANCE_NOT_FOUND,           CMPI_RC_ERR_NOT_FOUND},
    {Status_Family::DELETE_INSTANCE,       DELETE_INSTANCE_UNSUPPORTED,         CMPI_RC_ERR_NOT_SUPPORTED},
    {Status_Family::DELETE_INSTANCE,       DELETE_INSTANCE_ACCESS_DENIED,       CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::DELETE_INSTANCE,       DELETE_INSTANCE_FAILED,              CMPI_RC_ERR_FAILED},
    {Status_Family::ENUM_INSTANCES,        ENUM_INSTANCES_FAILED,               CMPI_RC_ERR_FAILED},
    {Status_Family::ENUM_INSTANCES,        ENUM_INSTANCES_ACCESS_DENIED,        CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::INVOKE_METHOD,         INVOKE_METHOD_FAILED,                CMPI_RC_ERR_FAILED},
    {Status_Family::INVOKE_METHOD,         INVOKE_METHOD_UNSUPPORTED,           CMPI_RC_ERR_NOT_SUPPORTED},
    {Status_Family::INVOKE_METHOD,         INVOKE_METHOD_ACCESS_DENIED,         CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::ENUM_ASSOCIATORS,      ENUM_ASSOCIATORS_FAILED,             CMPI_RC_ERR_FAILED},
    {Status_Family::ENUM_ASSOCIATORS,      ENUM_ASSOCIATORS_ACCESS_DENIED,      CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_FAILED,        CMPI_RC_ERR_FAILED},
    {Status_Family::ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_UNSUPPORTED,   CMPI_RC_ERR_NOT_SUPPORTED},
    {Status_Family::ENUM_ASSOCIATOR_NAMES, ENUM_ASSOCIATOR_NAMES_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::ENUM_REFERENCES,       ENUM_REFERENCES_FAILED,              CMPI_RC_ERR_FAILED},
    {Status_Family::ENUM_REFERENCES,       ENUM_REFERENCES_UNSUPPORTED,         CMPI_RC_ERR_NOT_SUPPORTED},
    {Status_Family::ENUM_REFERENCES,       ENUM_REFERENCES_ACCESS_DENIED,       CMPI_RC_ERR_ACCESS_DENIED},
    {Status_Family::ENABLE_INDICATIONS,    ENABLE_INDICATIONS_FAILED,           CMPI_RC_ERR_FAILED},
    {Status_Family::DISABLE_INDICATIONS,   DISABLE_INDICATIONS_FAILED,          CMPI_RC_ERR_FAILED},
};
// clang-format on

CMPIrc translate(Status_Family family, int status)
{
    // Success is 0 in every family.
    if (status == 0)
        return CMPI_RC_OK;
    for (const Status_Row& row : status_rows) {
        if (row.family == family && row.status == status)
            return row.rc;
    }
    return CMPI_RC_OK;
}

} // namespace KPRV
