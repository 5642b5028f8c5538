#pragma once

#include "broker/values/Class_Catalogue.h"
#include "broker/values/Receiver.h"
#include "broker/values/Request.h"
#include "kldrcim/client/Http_Client.h"
#include "kldrcim/wire/Xml_Reader.h"

namespace KPRV::kldrcim {

using namespace broker;

/// Sends a message and reads what is answered: each object goes to `take` as soon as it is there. Gives the
/// status, and for a method what it returned. Throws `Connection_Error` for whatever is no answer of a CIM
/// server.
class Cim_Answer
{
public:
    /// Gets each object; false for enough.
    using Take = std::function<bool(Xml_Node)>;

    Cim_Answer(Http_Sender& http, Take take);

    /// `method` is the declaration of the method that is called, null for none or an unknown one.
    Result ask(const Http_Message& message, const Class_Catalogue& catalogue,
               const Method_Info* method = nullptr);

private:
    bool read(const Http_Head& head, std::string_view piece);
    void check(const Http_Head& head) const;
    [[noreturn]] void refuse(const std::string& why) const;
    Result result(const Http_Head& head, const Class_Catalogue& catalogue, const Method_Info* method) const;

    Http_Sender& _http;
    Take _take;
    bool _has_enough = false;
    Xml_Reader _reader;
};

/// Asks for a request's objects; they go to the receiver as the module would hand them over.
Result ask_for_objects(Http_Sender& http, const Class_Catalogue& catalogue, const Request& request,
                       Receiver& receiver);

} // namespace KPRV::kldrcim
