#include "StopSignal.h"

#include <atomic>

namespace host {

namespace {

std::atomic<bool> isStopRaised{false};
static_assert(std::atomic<bool>::is_always_lock_free, "a signal handler takes no lock");

void raiseStop(int /*signal*/) {
    isStopRaised = true;
}

} // namespace

StopSignal::StopSignal() : mPreviousInterrupt{}, mPreviousTermination{} {
    isStopRaised = false;
    struct sigaction action = {};
    action.sa_handler = raiseStop;
    action.sa_flags = static_cast<int>(SA_RESETHAND);
    sigaction(SIGINT, &action, &mPreviousInterrupt);
    sigaction(SIGTERM, &action, &mPreviousTermination);
}

StopSignal::~StopSignal() {
    sigaction(SIGINT, &mPreviousInterrupt, nullptr);
    sigaction(SIGTERM, &mPreviousTermination, nullptr);
}

bool StopSignal::isRaised() {
    return isStopRaised;
}

} // namespace host
