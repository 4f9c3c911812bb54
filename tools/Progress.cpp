#include "Progress.h"

#include <iostream>

#include <unistd.h>

namespace {

constexpr std::chrono::milliseconds FIRST_AFTER(1000);
constexpr std::chrono::milliseconds AGAIN_AFTER(200);

} // namespace

Progress::Progress() : mIsTerminal(isatty(STDERR_FILENO) == 1), mNext(Clock::now() + FIRST_AFTER) {}

Progress::~Progress() {
    if (mIsShown)
        std::cerr << "\r\033[K";
}

void Progress::show(int done, int all) {
    if (!mIsTerminal || Clock::now() < mNext)
        return;
    mNext = Clock::now() + AGAIN_AFTER;
    mIsShown = true;
    std::cerr << "\rfwzel: frame " << done << " of " << all << std::flush;
}
