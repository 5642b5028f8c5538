#include "kldrcim/server/Body_Pipe.h"

#include <algorithm>
#include <cstring>

namespace KPRV::kldrcim {

bool Body_Pipe::send(std::string&& text)
{
    const Auto_Lock lock(mutex_);
    while (bytes_ >= most_bytes && !closed_)
        changed_.wait(mutex_);
    if (closed_)
        return false;
    bytes_ += text.size();
    pieces_.push_back(std::move(text));
    changed_.notify_all();
    return true;
}

void Body_Pipe::finish(bool broken)
{
    const Auto_Lock lock(mutex_);
    finished_ = true;
    broken_ = broken;
    changed_.notify_all();
}

void Body_Pipe::close()
{
    const Auto_Lock lock(mutex_);
    closed_ = true;
    changed_.notify_all();
}

void Body_Pipe::wait_for_piece()
{
    while (pieces_.empty() && !finished_ && !closed_)
        changed_.wait(mutex_);
}

bool Body_Pipe::wait()
{
    const Auto_Lock lock(mutex_);
    wait_for_piece();
    return !pieces_.empty();
}

std::size_t Body_Pipe::read(char* to, std::size_t size)
{
    const Auto_Lock lock(mutex_);
    wait_for_piece();
    if (pieces_.empty())
        return 0;
    const std::string& piece = pieces_.front();
    const std::size_t count = std::min(size, piece.size() - taken_);
    std::memcpy(to, piece.data() + taken_, count);
    taken_ += count;
    bytes_ -= count;
    if (taken_ == piece.size()) {
        pieces_.pop_front();
        taken_ = 0;
    }
    changed_.notify_all();
    return count;
}

bool Body_Pipe::is_broken() const
{
    const Auto_Lock lock(mutex_);
    return broken_ || closed_;
}

} // namespace KPRV::kldrcim
