#pragma once

#include "FifLocker.h"

// How ThreadSanitizer should see the hand-over of a queued signal from the
// search thread to the GUI thread. Qt builds the queued call's event (and
// copies the arguments into it) inside the emit and passes it on through its
// own locked queue; Debian's Qt is not instrumented, so the tool sees neither
// that lock nor the writes' publication, and takes the slot's reads for
// races. In a ThreadSanitizer build the sender therefore releases the
// receiver before the emit (what it wrote before, the hits of a batch
// included, then happens before the slot) and the writes Qt makes inside the
// emit are not recorded; the slot acquires the receiver before it reads its
// arguments. In every other build this does nothing.

#ifdef FIF_TSAN
extern "C" void AnnotateIgnoreWritesBegin(const char* file, int line);
extern "C" void AnnotateIgnoreWritesEnd(const char* file, int line);
#endif

namespace Gui {
namespace Orba {

// Lives around the emit of a signal queued to `receiver`.
class FifHandOff
{
public:
    explicit FifHandOff(const void* receiver)
    {
#ifdef FIF_TSAN
        __tsan_release(const_cast<void*>(receiver));
        AnnotateIgnoreWritesBegin(__FILE__, __LINE__);
#else
        Q_UNUSED(receiver);
#endif
    }

    ~FifHandOff()
    {
#ifdef FIF_TSAN
        AnnotateIgnoreWritesEnd(__FILE__, __LINE__);
#endif
    }

    FifHandOff(const FifHandOff&) = delete;
    FifHandOff& operator=(const FifHandOff&) = delete;

    // What a thread wrote before this call happens before what another
    // thread does after received() on the same object: used for the end of
    // a search thread, which Qt's uninstrumented join hides from the tool.
    static void sent(const void* receiver)
    {
#ifdef FIF_TSAN
        __tsan_release(const_cast<void*>(receiver));
#else
        Q_UNUSED(receiver);
#endif
    }

    // Called by the receiving slot before it reads its arguments.
    static void received(const void* receiver)
    {
#ifdef FIF_TSAN
        __tsan_acquire(const_cast<void*>(receiver));
#else
        Q_UNUSED(receiver);
#endif
    }
};

} // namespace Orba
} // namespace Gui
