#pragma once

/// Says which mutex guards what, in words that clang checks (the preset `clang`) and that other compilers do
/// not see. A mutex is an argument as a member or a variable is named where the words stand.
///
///     Mutex _lock;
///     std::deque<int> _queue GUARDED_BY(_lock);     read and written only while _lock is held
///     void shorten() REQUIRES(_lock);               called only while _lock is held
#if defined(__clang__)
#define KPRV_THREAD_ANNOTATION(attribute) __attribute__((attribute))
#else
#define KPRV_THREAD_ANNOTATION(attribute)
#endif

#define GUARDED_BY(mutex) KPRV_THREAD_ANNOTATION(guarded_by(mutex))
#define PT_GUARDED_BY(mutex) KPRV_THREAD_ANNOTATION(pt_guarded_by(mutex)) // what a pointer points to
#define REQUIRES(...) KPRV_THREAD_ANNOTATION(requires_capability(__VA_ARGS__))

#define UNCHECKED KPRV_THREAD_ANNOTATION(no_thread_safety_analysis) // say why

// For what locks: a class of mutexes, a class that holds one for a scope, and what its functions do. Without
// an argument it is the object itself, or what it holds.
#define CAPABILITY(kind) KPRV_THREAD_ANNOTATION(capability(kind))
#define SCOPED_CAPABILITY KPRV_THREAD_ANNOTATION(scoped_lockable)
#define ACQUIRE(...) KPRV_THREAD_ANNOTATION(acquire_capability(__VA_ARGS__))
#define ACQUIRE_SHARED(...) KPRV_THREAD_ANNOTATION(acquire_shared_capability(__VA_ARGS__))
#define TRY_ACQUIRE(...) KPRV_THREAD_ANNOTATION(try_acquire_capability(__VA_ARGS__))
#define RELEASE(...) KPRV_THREAD_ANNOTATION(release_capability(__VA_ARGS__))
#define RELEASE_SHARED(...) KPRV_THREAD_ANNOTATION(release_shared_capability(__VA_ARGS__))
