#ifndef HOST_PRODUCERTHREAD_H
#define HOST_PRODUCERTHREAD_H

#include <condition_variable>
#include <functional>
#include <mutex>
#include <thread>

namespace host {

/// A thread that does one piece of work at a time beside the render thread, such as writing the next picture
/// into a mapped PBO.
///
/// Thread: the operations are the render thread's. Each piece of work happens after what stood before its
/// start() and before what stands behind the finish() that follows.
class ProducerThread {
public:
    ProducerThread();

    /// Waits for the work at hand.
    ~ProducerThread();
    ProducerThread(const ProducerThread&) = delete;
    ProducerThread& operator=(const ProducerThread&) = delete;

    /// Begins a piece of work; the one before must be finished.
    void start(std::function<void()> work);

    /// Waits until no work is at hand.
    void finish();

private:
    void run();

    std::mutex mMutex;
    std::condition_variable mChanged;
    std::function<void()> mWork;
    bool mIsEnding = false;
    std::thread mThread;
};

} // namespace host

#endif
