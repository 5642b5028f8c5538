"""module/schema/<Class>_Skeleton.h: the base of a provider, with a stub per method and the method dispatch."""

from . import cpp
from .flags import OUT

BASES = {
    "instance": "Instance_Skeleton",
    "association": "Association_Skeleton",
    "indication": "Indication_Skeleton",
}


def parameter_type(parameter):
    """In only: read-only; a parameter that goes out is the record's own cell."""
    goes_out = parameter.flags & OUT
    if parameter.kind == "reference" and not parameter.array:
        return f"{parameter.target}*&" if goes_out else f"const {parameter.target}*"
    return f"{'' if goes_out else 'const '}{cpp.cell_type(parameter)}&"


def stub(class_, method):
    parameters = [f"const {class_.name}* /*self*/"]
    parameters += [f"{parameter_type(p)} /*{p.name}*/" for p in method.parameters]
    parameters.append(f"Property<{cpp.cpp_type(method.type)}>& /*return_value*/")
    return (
        f"    Invoke_Method_Status {method.name}({', '.join(parameters)}) {{ return INVOKE_METHOD_UNSUPPORTED; }}"
    )


def call(method):
    cells = "".join(f", record.{parameter.name}" for parameter in method.parameters)
    return [
        f'    if (strcasecmp(name, "{method.name}") == 0) {{',
        f"        [[maybe_unused]] auto& record = *static_cast<{cpp.method_record(method)}*>(method);",
        f"        return provider.{method.name}(self{cells}, record.return_value);",
        "    }",
    ]


def skeleton(class_, kind):
    methods = class_.methods if kind != "indication" else []
    includes = [f"module/schema/{class_.name}.h", "module/schema/skeleton.h"]
    includes += [f"module/schema/{owner}_methods.h" for owner in dict.fromkeys(method.owner for method in methods)]
    base = f"{BASES[kind]}<{class_.name}>"
    if not methods:
        return cpp.header(includes, [f"class {class_.name}_Skeleton : public {base} {{}};"])
    body = [
        f"class {class_.name}_Skeleton : public {base} {{",
        "public:",
        "    static constexpr bool has_methods = true;",
        *(stub(class_, method) for method in methods),
        "    /// The method of the record's name, whatever its case; -1 for an unknown one.",
        "    template <class Provider>",
        f"    static int invoke(Provider& provider, const {class_.name}* self, Instance* method)",
        "    {",
        "        const char* const name = method->__meta_class->name;",
        *("    " + line for method in methods for line in call(method)),
        "        return -1;",
        "    }",
        "};",
    ]
    return cpp.header(includes, body)


def emit(providers, output):
    for class_, kind in providers:
        output.add(f"module/schema/{class_.name}_Skeleton.h", skeleton(class_, kind))
