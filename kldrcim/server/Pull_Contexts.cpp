#include "kldrcim/server/Pull_Contexts.h"

#include <random>

namespace KPRV::kldrcim {

void Pull_Contexts::sweep(Clock::time_point now)
{
    std::erase_if(kept_, [&](const auto& entry) { return entry.second.end <= now; });
}

std::string Pull_Contexts::put(std::unique_ptr<Pull_Context> context, Clock::time_point now)
{
    const Auto_Lock lock(mutex_);
    sweep(now);
    if (kept_.size() >= most)
        return {};
    // Not to be guessed: a context is all that a client needs to read what another has asked for.
    std::random_device random;
    std::string name;
    do {
        name = std::to_string(std::uint64_t(random()) << 32 | random());
    } while (kept_.contains(name));
    const auto end = now + context->lifetime;
    kept_.emplace(name, Kept{std::move(context), end});
    return name;
}

void Pull_Contexts::put_back(const std::string& name, std::unique_ptr<Pull_Context> context,
                             Clock::time_point now)
{
    const Auto_Lock lock(mutex_);
    const auto end = now + context->lifetime;
    kept_.emplace(name, Kept{std::move(context), end});
}

std::unique_ptr<Pull_Context> Pull_Contexts::take(const std::string& name, Clock::time_point now)
{
    const Auto_Lock lock(mutex_);
    sweep(now);
    const auto found = kept_.find(name);
    if (found == kept_.end())
        return nullptr;
    auto context = std::move(found->second.context);
    kept_.erase(found);
    return context;
}

std::size_t Pull_Contexts::count() const
{
    const Auto_Lock lock(mutex_);
    return kept_.size();
}

} // namespace KPRV::kldrcim
