#include "kldrcim/server/Pull_Contexts.h"

#include <random>

namespace KPRV::kldrcim {

std::vector<Pull_Contexts::Kept> Pull_Contexts::take_old(Clock::time_point now)
{
    std::vector<Kept> old;
    for (auto each = _kept.begin(); each != _kept.end();) {
        const bool is_old = each->second.end <= now;
        if (is_old)
            old.push_back(std::move(each->second));
        each = is_old ? _kept.erase(each) : std::next(each);
    }
    return old;
}

void Pull_Contexts::sweep(Clock::time_point now)
{
    std::vector<Kept> old;
    const Auto_Lock lock(_mutex);
    old = take_old(now);
}

std::string Pull_Contexts::put(std::unique_ptr<Pull_Context> context, Clock::time_point now)
{
    std::vector<Kept> old;
    const Auto_Lock lock(_mutex);
    old = take_old(now);
    if (_kept.size() >= MOST)
        return {};
    // Not to be guessed: a context is all that a client needs to read what another has asked for.
    std::random_device random;
    std::string name;
    do {
        name = std::to_string(std::uint64_t(random()) << 32 | random());
    } while (_kept.contains(name));
    const auto end = now + context->lifetime;
    _kept.emplace(name, Kept{std::move(context), end});
    return name;
}

void Pull_Contexts::put_back(const std::string& name, std::unique_ptr<Pull_Context> context,
                             Clock::time_point now)
{
    const Auto_Lock lock(_mutex);
    const auto end = now + context->lifetime;
    _kept.emplace(name, Kept{std::move(context), end});
}

std::unique_ptr<Pull_Context> Pull_Contexts::take(const std::string& name, Clock::time_point now)
{
    std::vector<Kept> old;
    const Auto_Lock lock(_mutex);
    old = take_old(now);
    const auto found = _kept.find(name);
    if (found == _kept.end())
        return nullptr;
    auto context = std::move(found->second.context);
    _kept.erase(found);
    return context;
}

std::size_t Pull_Contexts::count() const
{
    const Auto_Lock lock(_mutex);
    return _kept.size();
}

} // namespace KPRV::kldrcim
