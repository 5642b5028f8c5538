#pragma once

#include "broker/values/Request.h"
#include "kldrcim/wire/Wire_Error.h"
#include "kldrcim/wire/Xml_Document.h"

namespace KPRV::kldrcim {

/// What is answered by HTTP alone: the message is no message, or of a kind that nobody understands.
struct Http_Refusal
{
    unsigned status = 400;
    /// The word for the header CIMError; null for none.
    const char* cim_error = nullptr;
    std::string text;
};

/// One request. Its nodes belong to the document.
struct Cim_Call
{
    /// Of a method of a class; else the name is that of an operation.
    bool is_extrinsic = false;
    std::string name;
    std::string name_space;
    /// Of a method: LOCALINSTANCEPATH or LOCALCLASSPATH.
    Xml_Node object;
    /// IMETHODCALL or METHODCALL, which hold the parameters.
    Xml_Node element;
};

/// What a message asks for.
struct Cim_Message
{
    std::string id;
    /// Several requests in one, which are answered one after the other.
    bool is_multiple = false;
    /// At least one.
    std::vector<Cim_Call> calls;
};

/// Throws `Http_Refusal`.
Cim_Message read_message(const Xml_Document& document);

/// The header fields that say what the message says; absent ones are null.
struct Cim_Headers
{
    const char* operation = nullptr;
    const char* method = nullptr;
    const char* object = nullptr;
    const char* protocol_version = nullptr;
    /// In the place of method and object where a message has several requests.
    const char* batch = nullptr;
};

/// What is there must agree with the message. Throws `Http_Refusal`.
void check_headers(const Cim_Headers& headers, const Cim_Message& message);

/// The parameters of an operation. What is wrong with them is thrown as `Wire_Error`: status 7 for one that
/// the operation has not, 4 for one that is there twice, that is missing or that has another value.
class Parameters
{
public:
    /// `known` are names with blanks between them.
    Parameters(const Cim_Call& call, std::string_view known);

    /// The value of a parameter; no node if it is absent or null.
    Xml_Node find(std::string_view name) const;
    Xml_Node required(std::string_view name) const;

    bool flag(std::string_view name, bool otherwise) const;
    std::optional<std::uint64_t> number(std::string_view name) const;
    std::string text(std::string_view name) const;
    /// Empty if it is absent.
    std::string class_name(std::string_view name) const;
    std::string required_class_name(std::string_view name) const;
    Property_List names(std::string_view name) const;

private:
    std::vector<std::pair<std::string, Xml_Node>> _values;
};

} // namespace KPRV::kldrcim
