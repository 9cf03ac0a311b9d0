#pragma once

#include <QReadWriteLock>

// ThreadSanitizer cannot see inside Qt's prebuilt library, where
// QReadWriteLock synchronises with futexes and atomics, so under it every
// access guarded by such a lock would look like a race. In a ThreadSanitizer
// build the locker therefore describes each lock and unlock to the tool with
// its mutex annotations: the tool then checks our locking exactly as it
// checks a pthread read/write lock (no access outside the lock goes
// unnoticed). In every other build it is a plain QReadLocker/QWriteLocker.
#if defined(__SANITIZE_THREAD__)
#define FIF_TSAN 1
#elif defined(__has_feature)
#if __has_feature(thread_sanitizer)
#define FIF_TSAN 1
#endif
#endif

#ifdef FIF_TSAN
#include <sanitizer/tsan_interface.h>
#endif

namespace Gui {
namespace Orba {

// Holds `lock` for reading or writing for the locker's lifetime.
class FifLocker
{
public:
    enum Mode { Read, Write };

    FifLocker(QReadWriteLock* lock, Mode mode)
        : lock(lock)
#ifdef FIF_TSAN
        , mode(mode)
#endif
    {
#ifdef FIF_TSAN
        __tsan_mutex_pre_lock(lock, flags());
#endif
        if (mode == Read)
            lock->lockForRead();
        else
            lock->lockForWrite();
#ifdef FIF_TSAN
        __tsan_mutex_post_lock(lock, flags(), 0);
#endif
    }

    ~FifLocker()
    {
#ifdef FIF_TSAN
        __tsan_mutex_pre_unlock(lock, flags());
#endif
        lock->unlock();
#ifdef FIF_TSAN
        __tsan_mutex_post_unlock(lock, flags());
#endif
    }

    FifLocker(const FifLocker&) = delete;
    FifLocker& operator=(const FifLocker&) = delete;

    // Called by the owner of `lock` before it goes, so that the tool does not
    // take a later object at the same address for the same lock.
    static void forget(QReadWriteLock* lock)
    {
#ifdef FIF_TSAN
        __tsan_mutex_destroy(lock, __tsan_mutex_not_static);
#else
        Q_UNUSED(lock);
#endif
    }

private:
#ifdef FIF_TSAN
    unsigned flags() const { return mode == Read ? __tsan_mutex_read_lock : 0u; }
#endif

    QReadWriteLock* lock;
#ifdef FIF_TSAN
    Mode mode;
#endif
};

} // namespace Orba
} // namespace Gui
