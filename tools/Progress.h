#ifndef TOOLS_PROGRESS_H
#define TOOLS_PROGRESS_H

#include <chrono>

/// A line on standard error that tells how far long work has come: only where that is a terminal, and only
/// after a while.
class Progress {
public:
    Progress();

    /// Takes the line away.
    ~Progress();
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;

    void show(int done, int all);

private:
    using Clock = std::chrono::steady_clock;
    bool mIsTerminal;
    bool mIsShown = false;
    Clock::time_point mNext;
};

#endif
