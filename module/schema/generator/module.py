"""module/exports/*.cpp: registration records and exported factories of the providers; each provider file defines its own
dispatcher, __cimple_<Class>_Provider_proc."""

from . import cpp

#: The library's name as servers know it: libNAME.so.
MODULE = "kldrprovider_Module"

#: The management interfaces of a kind of provider, each with the letter that asks for it.
INTERFACES = {
    "instance": [("Instance", "I"), ("Method", "M")],
    "association": [("Association", "A"), ("Instance", "I"), ("Method", "M")],
    "indication": [("Indication", "N"), ("Method", "M")],
}

# One provider's block, and a pair of factories per interface: the long name does the work, the short one forwards.
FACTORY_MACROS = r"""
#define EXPORT extern "C" __attribute__((visibility("default")))
#define ARGUMENTS const CMPIBroker *broker, const CMPIContext *context, CMPIStatus *
#define AREA(C) alignas(16) static char _cmpi_static_data##C##_Provider[2048];
#define FACTORY(C, KIND, LETTER) \
    EXPORT CMPI##KIND##MI* C##_Provider_Create_##KIND##MI(ARGUMENTS status) \
    { \
        return static_cast<CMPI##KIND##MI*>(create_mi(_cmpi_static_data##C##_Provider, \
                                                      &_cimple_registration_##C##_Provider, broker, context, \
                                                      #C "_Provider", LETTER, status)); \
    } \
    EXPORT CMPI##KIND##MI* C##_Create_##KIND##MI(ARGUMENTS status) \
    { \
        return C##_Provider_Create_##KIND##MI(broker, context, status); \
    }
"""

# The records, and the one initialiser that fills and links them: each takes the previous head as its next.
REGISTRATION = r"""
const Registration* _cimple_registration_head;
static bool link_record(Registration& record, const char* name, Provider_Proc proc, const Meta_Class& meta_class)
{
    record = {_cimple_module_name, name, proc, &meta_class, _cimple_registration_head};
    _cimple_registration_head = &record;
    return true;
}
#define PROVIDER(C) \
    int __cimple_##C##_Provider_proc(const Registration*, int, void*, void*, void*, void*, void*, void*, void*, void*); \
    Registration _cimple_registration_##C##_Provider;
#define LINK(C) \
    link_record(_cimple_registration_##C##_Provider, #C "_Provider", __cimple_##C##_Provider_proc, \
                C::static_meta_class)
"""


def registration(providers):
    names = [class_.name for class_, _ in providers]
    includes = ["module/schema/module_registration.h", "module/runtime/dispatch/version.h", *(f"module/schema/{name}.h" for name in names)]
    body = [
        f'const char _cimple_module_name[] = "{MODULE}";',
        REGISTRATION,
        *(f"PROVIDER({name})" for name in names),
        "[[maybe_unused]] static const bool _cimple_linked =",
        "\n&& ".join(f"LINK({name})" for name in names) + ";",
    ]
    return cpp.namespaced(includes, body)


def factories(providers):
    includes = [
        "module/cmpi/exception_containment.h",
        "module/runtime/dispatch/Registration.h",
        "module/runtime/dispatch/version.h",
    ]
    names = [class_.name for class_, _ in providers]
    body = [f"extern Registration _cimple_registration_{name}_Provider;" for name in names]
    text = cpp.namespaced(includes, body) + "using namespace KPRV;" + FACTORY_MACROS
    for class_, kind in providers:
        text += f"AREA({class_.name})\n"
        for interface, letter in INTERFACES[kind]:
            text += f"FACTORY({class_.name}, {interface}, '{letter}')\n"
    return text


def emit(providers, output):
    output.add("module/exports/registration.cpp", registration(providers))
    output.add("module/exports/factories.cpp", factories(providers))
