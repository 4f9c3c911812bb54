#ifndef HOST_STOPSIGNAL_H
#define HOST_STOPSIGNAL_H

#include <csignal>

namespace host {

/// Turns the first SIGINT or SIGTERM of the time that it lives into a flag; the signals do again what they
/// did before after that, and when it is gone. There is one at a time.
class StopSignal {
public:
    StopSignal();
    ~StopSignal();
    StopSignal(const StopSignal&) = delete;
    StopSignal& operator=(const StopSignal&) = delete;

    /// Any thread.
    static bool isRaised();

private:
    struct sigaction mPreviousInterrupt;
    struct sigaction mPreviousTermination;
};

} // namespace host

#endif
