#pragma once

#include "broker/Provider_Set.h"

namespace KPRV::broker {

/// Sends a request into one provider class: opens a call frame, presents the request as CMPI objects, calls
/// the entry and reads the answer back. What the answer owes by contract and does not have is a violation. An
/// exception that leaves the provider ends in the result. Rc 7 if the class has no such interface or entry.
/// With a receiver, instances and paths go there at once, those of a provider that fails later among them.
Result call_provider(Broker& broker, Provider_Set& providers, const std::string& class_name,
                     const Request& request, Receiver* receiver = nullptr);

/// What an entry of an indication interface needs, presented as CMPI objects for the length of the call.
class Mi_Frame
{
public:
    Mi_Frame(Broker& broker, const std::vector<Named_Value>& entries);

    const CMPIContext* context() const { return _context.cmpi(); }
    Core& core() const { return *_broker.core(); }

    /// Calls the function and turns its status, or the exception that left it, into the result's.
    template <class Function>
    void run(Result& result, Function function)
    {
        try {
            read_status(function(), result);
        } catch (const std::exception& error) {
            caught(result, error.what());
        } catch (...) {
            caught(result, "an exception of unknown type");
        }
    }

private:
    void read_status(const CMPIStatus& status, Result& result);
    void caught(Result& result, const char* what);

    Broker& _broker;
    Argument<Context_Object> _context;
    Call_Frame _frame;
};

} // namespace KPRV::broker
