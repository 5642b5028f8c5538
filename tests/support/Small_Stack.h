#pragma once

#include <gtest/gtest.h>
#include <pthread.h>

namespace KPRV {

/// Runs a body on a thread with a stack as small as those of one server's request threads, and waits for it.
template <class Body>
void on_small_stack(Body body)
{
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    // Their frames are several times as large.
    constexpr size_t size = 2048 * 1024;
#else
    constexpr size_t size = 256 * 1024;
#endif
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setstacksize(&attributes, size);
    const auto run = [](void* argument) -> void* {
        (*static_cast<Body*>(argument))();
        return nullptr;
    };
    pthread_t thread;
    ASSERT_EQ(0, pthread_create(&thread, &attributes, run, &body));
    pthread_join(thread, nullptr);
    pthread_attr_destroy(&attributes);
}

} // namespace KPRV
