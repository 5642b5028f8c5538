"""module/schema/<Class>.h and module/schema/<Class>_methods.h: a plain record per class and per method."""

from .cpp import cell_type, cpp_type, forward_declarations, header, method_record


def record(name, cells, meta):
    return [
        f"struct {name} : Instance {{",
        *(f"    {cell_type(cell)} {cell.name};" for cell in cells),
        f"    static const {meta} static_meta_class;",
        "};",
    ]


def class_header(class_):
    """The flat record: all cells in feature order, so that it has the layout of its superclass's record."""
    cells = class_.cells
    body = forward_declarations(cells, [class_.name]) + record(class_.name, cells, "Meta_Class")
    return header(["module/schema/record.h"], body)


def methods_header(class_):
    """The invocation records of the methods that the class declares; None without any."""
    own = [feature for feature in class_.own_features if feature.kind == "method"]
    if not own:
        return None
    body = forward_declarations([parameter for method in own for parameter in method.parameters])
    for method in own:
        lines = record(method_record(method), method.parameters, "Meta_Method")
        lines.insert(-2, f"    Property<{cpp_type(method.type)}> return_value;")
        body += lines
    return header(["module/schema/record.h"], body)


def emit(classes, output):
    for class_ in classes:
        output.add(f"module/schema/{class_.name}.h", class_header(class_))
        methods = methods_header(class_)
        if methods:
            output.add(f"module/schema/{class_.name}_methods.h", methods)
