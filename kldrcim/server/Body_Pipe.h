#pragma once

#include "kldrcim/server/Answer.h"
#include "module/runtime/system/Standard_Mutex.h"

#include <condition_variable>
#include <deque>

namespace KPRV::kldrcim {

/// Between the thread that makes a long answer and the one that sends it. It holds a few megabytes: most
/// answers fit, so that no provider waits for a client; who makes a longer one waits.
class Body_Pipe final : public Body_Sink
{
public:
    static constexpr std::size_t MOST_BYTES = std::size_t(4) << 20;

    struct Status
    {
        CMPIrc rc = CMPI_RC_OK;
        std::string text = {};
    };

    bool send(std::string&& text) override;
    /// Before anything is sent: who reads finds a status behind the text.
    void allow_status();
    bool take_status(CMPIrc rc, const std::string& text) override;
    /// What was taken, at the end.
    Status status() const;
    /// Nothing more comes. A broken answer has no end.
    void finish(bool broken);

    /// Nobody reads any more: whoever writes is told.
    void close();

    /// Waits for something to read; false if all is over.
    bool wait();
    /// Waits; 0 at the end.
    std::size_t read(char* to, std::size_t size);
    bool is_broken() const;

private:
    void wait_for_piece() REQUIRES(_mutex);

    mutable Standard_Mutex<> _mutex;
    std::condition_variable_any _changed;
    std::deque<std::string> _pieces GUARDED_BY(_mutex);
    /// What has been read of the first piece.
    std::size_t _taken GUARDED_BY(_mutex) = 0;
    std::size_t _bytes GUARDED_BY(_mutex) = 0;
    bool _finished GUARDED_BY(_mutex) = false;
    bool _broken GUARDED_BY(_mutex) = false;
    bool _closed GUARDED_BY(_mutex) = false;
    bool _takes_status GUARDED_BY(_mutex) = false;
    Status _status GUARDED_BY(_mutex);
};

} // namespace KPRV::kldrcim
