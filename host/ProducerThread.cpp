#include "ProducerThread.h"

#include <utility>

namespace host {

ProducerThread::ProducerThread() : mThread([this] { run(); }) {}

ProducerThread::~ProducerThread() {
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mIsEnding = true;
    }
    mChanged.notify_all();
    mThread.join();
}

void ProducerThread::start(std::function<void()> work) {
    {
        const std::lock_guard<std::mutex> lock(mMutex);
        mWork = std::move(work);
    }
    mChanged.notify_all();
}

void ProducerThread::finish() {
    std::unique_lock<std::mutex> lock(mMutex);
    mChanged.wait(lock, [this] { return !mWork; });
}

void ProducerThread::run() {
    std::unique_lock<std::mutex> lock(mMutex);
    for (;;) {
        mChanged.wait(lock, [this] { return mWork || mIsEnding; });
        if (!mWork)
            return;
        lock.unlock();
        mWork(); // start() does not touch it before finish()
        lock.lock();
        mWork = nullptr;
        mChanged.notify_all();
    }
}

} // namespace host
