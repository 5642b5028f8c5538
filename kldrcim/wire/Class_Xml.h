#pragma once

#include "broker/values/Class_Catalogue.h"
#include "broker/values/Request.h"
#include "kldrcim/wire/Xml_Document.h"
#include "kldrcim/wire/Xml_Writer.h"

namespace KPRV::kldrcim {

using namespace broker;

/// How much of a class is written.
struct Class_Form
{
    /// Only what the class itself declares.
    bool local_only = true;
    bool qualifiers = true;
    /// Where each feature was first declared.
    bool origins = false;
    /// Only these properties; all if it is absent. Methods do not count.
    Property_List properties = {};
};

/// CLASS of the catalogue.
void write_class(Xml_Writer& writer, const Class_Catalogue& catalogue, const Class_Info& info,
                 const Class_Form& form);

/// CLASS as a record; what its qualifiers do not say is not known. Throws `Wire_Error`.
Class_Info read_class(Xml_Node node);

} // namespace KPRV::kldrcim
