#ifndef HOST_STAGETIMES_H
#define HOST_STAGETIMES_H

#include <FwZel/PerfMeasure.h>

#include <array>
#include <cstddef>

namespace host {

/// What a frame is made of.
enum class Stage { UPLOAD, DRAWING, READBACK };

/// The milliseconds that each stage takes, over windows of frames. Thread: the render thread.
class StageTimes {
public:
    using Records = std::array<PerfMeasure::ProcTimeData, 3>;

    /// @param window  frames over which average, minimum and maximum are taken, at least 1
    explicit StageTimes(int window);

    /// Measures a stage of this frame as long as it lives.
    ///
    /// OpenGL only queues what it is asked to do. For times that tell of the work itself the measurement
    /// waits for it at its end, which costs the overlap of the stages.
    class Measurement {
    public:
        Measurement(StageTimes& times, Stage stage);
        ~Measurement();
        Measurement(const Measurement&) = delete;
        Measurement& operator=(const Measurement&) = delete;

    private:
        StageTimes& mTimes;
        PerfMeasure::ProcTimeData& mRecord;
        double mStart;
    };

    /// Whether measurements wait for OpenGL; they do not at first.
    void setWaiting(bool isWaiting) { mIsWaiting = isWaiting; }

    /// Accounts the frame; the next begins.
    void endFrame();

    /// Whether the latest frame closed a window.
    bool isWindowClosed() const { return mRecords[0].aveUpdate; }

    /// By stage: name, and aveTime, minTime, maxTime in milliseconds.
    const Records& records() const { return mRecords; }

private:
    Records mRecords;
    bool mIsWaiting = false;
};

} // namespace host

#endif
