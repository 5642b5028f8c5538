#pragma once

#include "broker/values/Request.h"
#include "kldrcim/server/Object_Text.h"
#include "kldrcim/server/Text_Spool.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <chrono>
#include <condition_variable>
#include <functional>
#include <thread>

namespace KPRV::kldrcim {

/// An opened enumeration. Its objects are made on a thread of their own, and wait as texts until a client
/// pulls them: the first can be had while the provider works on the others, and no client's pace holds up a
/// provider, which may have a lock while it hands objects over.
class Pull_Context
{
public:
    enum Kind
    {
        INSTANCES,
        PATHS,
        /// Instances without paths: what a query selects.
        ROWS,
    };
    enum State
    {
        MORE,
        END,
        FAILED,
    };
    /// Asks the provider; what it hands over goes to the receiver.
    using Make = std::function<Result(Receiver& receiver)>;

    /// Between two pulls lies no more than `lifetime`.
    Pull_Context(Kind kind, std::string name_space, std::chrono::seconds lifetime)
        : kind(kind), name_space(std::move(name_space)), lifetime(lifetime)
    {
    }
    /// Nothing more is asked for; waits until the provider has noticed.
    ~Pull_Context();
    Pull_Context(const Pull_Context&) = delete;
    Pull_Context& operator=(const Pull_Context&) = delete;

    /// Once. `text` is how objects are written.
    void start(Object_Text text, Make make);

    /// Waits until it is known what a pull of so many gives: all of them and there are MORE, fewer or as many
    /// with the END, or that it FAILED before there were so many.
    State wait(std::uint64_t count);
    /// The next object, if there is one.
    std::optional<std::string> take();
    /// Why it FAILED.
    Result failure() const;

    const Kind kind;
    const std::string name_space;
    const std::chrono::seconds lifetime;

private:
    class Spooling;

    void run(const Object_Text& text, const Make& make);
    bool put(std::string&& object);

    mutable Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    Text_Spool _objects GUARDED_BY(_mutex);
    Result _result GUARDED_BY(_mutex);
    bool _finished GUARDED_BY(_mutex) = false;
    bool _closed GUARDED_BY(_mutex) = false;
    std::thread _maker;
};

} // namespace KPRV::kldrcim
