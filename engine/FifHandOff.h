#pragma once

#include "FifLocker.h"

// How ThreadSanitizer should see the end of a search thread. The GUI thread
// learns of it through QThread's own join, whose futexes inside Debian's
// uninstrumented Qt the tool does not see, and would take what it then
// reads of the run (the counters, the request, the thread's last writes)
// for races. In a ThreadSanitizer build the search thread therefore
// releases the job as its last step and the GUI thread acquires it after
// the join. In every other build this does nothing.
//
// What a search finds travels through the job's outbox, whose standard
// mutex the tool sees; no annotation is needed there.

namespace Gui {
namespace Orba {

class FifHandOff
{
public:
    // What a thread wrote before this call happens before what another
    // thread does after received() on the same object.
    static void sent(const void* receiver)
    {
#ifdef FIF_TSAN
        __tsan_release(const_cast<void*>(receiver));
#else
        Q_UNUSED(receiver);
#endif
    }

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
