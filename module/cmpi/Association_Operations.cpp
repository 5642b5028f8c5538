// The entries of the association table: who is joined to an object, and by what.
#include "module/cmpi/Converter.h"
#include "module/cmpi/Operation_Scope.h"
#include "module/cmpi/association_handlers.h"
#include "module/cmpi/cmpi_text.h"
#include "module/cmpi/entries.h"
#include "module/cmpi/status_translation.h"

#include <optional>

// None of the four ends its result with `CMReturnDone`: the return of the entry is the end. None reads the
// association class, since the server has come to its provider already.

namespace KPRV {

static String filter_of(const char* text)
{
    return String(text ? text : "");
}

/// The object that the associations are to touch. Otherwise the status that ends the entry: an object of a
/// class that this module does not know simply has no associations here, whatever the trace says.
static std::optional<CMPIStatus> no_source(const Operation_Scope& scope, const CMPIObjectPath* cop,
                                           CMPIrc traced_for_unknown, Ref<Instance>& source)
{
    const Meta_Class* const meta_class = scope.adapter()->find_meta_class(class_name_of(cop));
    if (!meta_class)
        return scope.ret_ok(LOG_HERE, traced_for_unknown);
    if (const CMPIrc rc = make_cimple_reference(nullptr, meta_class, cop, source); rc != CMPI_RC_OK)
        return scope.ret(LOG_HERE, rc);
    return std::nullopt;
}

static Association_Results results_of(const Operation_Scope& scope, const CMPIContext* context,
                                      const CMPIResult* result, const CMPIObjectPath* cop,
                                      const char** properties)
{
    return {scope.broker(), context, result, name_space_of(cop), properties, CMPI_RC_OK};
}

static CMPIStatus associators(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                              const CMPIObjectPath* cop, const char*, const char* result_class,
                              const char* role, const char* result_role, const char** properties)
{
    const Operation_Scope scope(_adapter(mi), context, "associators", LOG_HERE);
    Ref<Instance> instance;
    if (const auto end = no_source(scope, cop, CMPI_RC_OK, instance))
        return *end;

    const String result_class_text = filter_of(result_class);
    const String role_text = filter_of(role);
    const String result_role_text = filter_of(result_role);
    Association_Results data = results_of(scope, context, result, cop, properties);
    const int own = scope.adapter()->enum_associators(instance.ptr(), result_class_text, role_text,
                                                      result_role_text, associators1::_proc, &data);
    const CMPIrc own_rc = translate(Status_Family::ENUM_ASSOCIATORS, own);
    if (own_rc != CMPI_RC_OK || own == ENUM_ASSOCIATORS_OK)
        return scope.ret(LOG_HERE, own_rc);

    // The provider does not know its far ends as instances: the server is asked for each by name.
    Association_Results names = results_of(scope, context, result, cop, properties);
    const int status = scope.adapter()->enum_associator_names(instance.ptr(), result_class_text, role_text,
                                                              result_role_text, associators2::_proc, &names);
    return scope.ret(LOG_HERE, translate(Status_Family::ENUM_ASSOCIATOR_NAMES, status));
}

static CMPIStatus associatorNames(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                  const CMPIObjectPath* cop, const char*, const char* result_class,
                                  const char* role, const char* result_role)
{
    const Operation_Scope scope(_adapter(mi), context, "associatorNames", LOG_HERE);
    Ref<Instance> instance;
    if (const auto end = no_source(scope, cop, CMPI_RC_ERR_INVALID_CLASS, instance))
        return *end;

    Association_Results data = results_of(scope, context, result, cop, nullptr);
    const int status =
        scope.adapter()->enum_associator_names(instance.ptr(), filter_of(result_class), filter_of(role),
                                               filter_of(result_role), associator_names::_proc, &data);
    return scope.ret(LOG_HERE, translate(Status_Family::ENUM_ASSOCIATOR_NAMES, status));
}

/// A model of the provider's own class, as `create` leaves it.
static Ref<Instance> own_model(const Operation_Scope& scope)
{
    const Meta_Class* meta_class = nullptr;
    scope.adapter()->get_meta_class(meta_class);
    return Ref<Instance>(create(meta_class, false));
}

static CMPIStatus references(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                             const CMPIObjectPath* cop, const char*, const char* role,
                             const char** properties)
{
    const Operation_Scope scope(_adapter(mi), context, "references", LOG_HERE);
    Ref<Instance> instance;
    if (const auto end = no_source(scope, cop, CMPI_RC_ERR_INVALID_CLASS, instance))
        return *end;

    const Ref<Instance> model = own_model(scope);
    Association_Results data = results_of(scope, context, result, cop, properties);
    const int status = scope.adapter()->enum_references(instance.ptr(), model.ptr(), filter_of(role),
                                                        references_handler::_proc, &data);
    return scope.ret(LOG_HERE, translate(Status_Family::ENUM_REFERENCES, status));
}

static CMPIStatus referenceNames(CMPIAssociationMI* mi, const CMPIContext* context, const CMPIResult* result,
                                 const CMPIObjectPath* cop, const char*, const char* role)
{
    const Operation_Scope scope(_adapter(mi), context, "referenceNames", LOG_HERE);
    Ref<Instance> instance;
    if (const auto end = no_source(scope, cop, CMPI_RC_ERR_INVALID_CLASS, instance))
        return *end;

    const Ref<Instance> model = own_model(scope);
    // Either way (constant): whatever is not 0 is null.
    __set_null_flags(model.ptr(), false, true, 1);
    Association_Results data = results_of(scope, context, result, cop, nullptr);
    const int status = scope.adapter()->enum_references(instance.ptr(), model.ptr(), filter_of(role),
                                                        reference_names::_proc, &data);
    return scope.ret(LOG_HERE, translate(Status_Family::ENUM_REFERENCES, status));
}

void fill_association_operations(CMPIAssociationMIFT& ft)
{
    ft.associators = associators;
    ft.associatorNames = associatorNames;
    ft.references = references;
    ft.referenceNames = referenceNames;
}

} // namespace KPRV
