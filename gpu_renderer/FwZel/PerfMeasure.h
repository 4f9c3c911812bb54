#ifndef FWZEL_PERFMEASURE_H
#define FWZEL_PERFMEASURE_H

#include <FwZel/Export.h>

#include <string>

/// Turns the processing times of frames, measured by the host, into an average over one window of frames and
/// a minimum and maximum over another. Flags tell the host when a window has just closed, so that it can
/// print fresh figures once a window. All operations are class-wide; there are no objects of it.
///
/// Thread: a record belongs to the thread that updates it; nothing is locked.
class FWZEL_API PerfMeasure {
public:
    /// What is known of one measured stage. Reset it with initProcTimeData(), set the intervals, and then,
    /// once a frame, store the frame's time and call avarageProcTime().
    struct ProcTimeData {
        std::string name;   ///< label for the host's display; no operation reads or writes it
        int aveFcnt;        ///< frames counted in the current averaging window
        int aveInterval;    ///< length of the averaging window in frames; below 1 works as 1
        bool aveUpdate;     ///< the latest update closed an averaging window
        int minMaxFcnt;     ///< frames counted in the current minimum/maximum window
        int minMaxInterval; ///< length of the minimum/maximum window in frames; below 1 it never closes
        bool minMaxUpdate;  ///< the latest update closed a minimum/maximum window
        float sum;          ///< sum of the times of the current averaging window
        float time;         ///< time of the latest frame, stored by the host, in a unit of its choice
        float aveTime;      ///< average of the latest closed averaging window
        float maxTime;      ///< maximum so far of the current window, or of the window just closed
        float minTime;      ///< minimum so far of the current window, or of the window just closed
        float curMaxTime;   ///< running maximum of the current window, from 0.0
        float curMinTime;   ///< running minimum of the current window, from 1000000.0
    };

    /// The system's real-time clock (CLOCK_REALTIME) in seconds. The difference of two readings is a frame's
    /// time; a clock that is set meanwhile shows in it.
    static double getCurrentTimeInSec();

    /// Resets a record: intervals 1, flags false, minima 1000000.0, all else 0. The name is left alone.
    static void initProcTimeData(ProcTimeData& tbData);

    /// Restarts the minimum/maximum window only. Its interval and flag are left alone.
    static void initMinMaxData(ProcTimeData& tbData);

    /// Accounts one frame, whose time is in tbData.time. (The name is spelt as hosts know it.)
    static void avarageProcTime(ProcTimeData& tbData);

private:
    PerfMeasure() = delete;
};

#endif
