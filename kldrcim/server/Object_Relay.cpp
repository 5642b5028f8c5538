#include "kldrcim/server/Object_Relay.h"

#include <system_error>

namespace KPRV::kldrcim {

namespace {

/// For which no thread is begun.
constexpr std::size_t FEW = 64;
constexpr std::size_t BATCH_SIZE = 32;

} // namespace

Object_Relay::~Object_Relay()
{
    end();
}

bool Object_Relay::put(Object&& object)
{
    if (_count < FEW || _is_alone) {
        ++_count;
        return _function(object);
    }
    if (!_thread.joinable())
        try {
            _filled.reserve(BATCH_SIZE);
            _thread = std::thread([this] { run(); });
        } catch (const std::system_error&) {
            _is_alone = true;
            return _function(object);
        }
    _filled.push_back(std::move(object));
    return _filled.size() < BATCH_SIZE || hand_over();
}

bool Object_Relay::hand_over()
{
    {
        const Auto_Lock lock(_mutex);
        while (_is_waiting && !_refused)
            _changed.wait(_mutex);
        if (_refused)
            return false;
        _waiting.swap(_filled);
        _is_waiting = true;
        _changed.notify_all();
    }
    _filled.clear();
    return true;
}

void Object_Relay::end()
{
    if (!_thread.joinable())
        return;
    {
        const Auto_Lock lock(_mutex);
        _no_more = true;
        _changed.notify_all();
    }
    _thread.join();
}

void Object_Relay::finish()
{
    if (!_filled.empty())
        hand_over();
    end();
    const Auto_Lock lock(_mutex);
    if (_failure)
        std::rethrow_exception(_failure);
}

void Object_Relay::run()
{
    try {
        work();
    } catch (...) {
        const Auto_Lock lock(_mutex);
        _failure = std::current_exception();
        _refused = true;
        _changed.notify_all();
    }
}

void Object_Relay::work()
{
    Batch batch;
    for (;;) {
        {
            const Auto_Lock lock(_mutex);
            while (!_is_waiting && !_no_more)
                _changed.wait(_mutex);
            if (!_is_waiting)
                return;
            batch.swap(_waiting);
            _is_waiting = false;
            _changed.notify_all();
        }
        for (Object& object : batch)
            if (!_function(object)) {
                const Auto_Lock lock(_mutex);
                _refused = true;
                _changed.notify_all();
                return;
            }
    }
}

} // namespace KPRV::kldrcim
