#include <FwZel/PerfMeasure.h>

#include <ctime>

namespace {

constexpr float MAX_START = 0.0F;
constexpr float MIN_START = 1000000.0F;

void updateAverage(PerfMeasure::ProcTimeData& tbData) {
    tbData.sum += tbData.time;
    tbData.aveFcnt += 1;
    if (tbData.aveInterval < 1)
        tbData.aveInterval = 1;
    tbData.aveUpdate = tbData.aveFcnt == tbData.aveInterval;
    if (!tbData.aveUpdate)
        return;
    tbData.aveTime = tbData.sum / static_cast<float>(tbData.aveFcnt);
    tbData.sum = 0.0F;
    tbData.aveFcnt = 0;
}

void updateMinMax(PerfMeasure::ProcTimeData& tbData) {
    tbData.minMaxFcnt += 1;
    if (tbData.time > tbData.curMaxTime)
        tbData.maxTime = tbData.curMaxTime = tbData.time;
    if (tbData.curMinTime > tbData.time)
        tbData.minTime = tbData.curMinTime = tbData.time;
    tbData.minMaxUpdate = tbData.minMaxFcnt == tbData.minMaxInterval;
    if (!tbData.minMaxUpdate)
        return;
    tbData.maxTime = tbData.curMaxTime;
    tbData.minTime = tbData.curMinTime;
    tbData.minMaxFcnt = 0;
    tbData.curMaxTime = MAX_START;
    tbData.curMinTime = MIN_START;
}

} // namespace

double PerfMeasure::getCurrentTimeInSec() {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1000000000.0;
}

void PerfMeasure::initProcTimeData(ProcTimeData& tbData) {
    tbData.aveFcnt = 0;
    tbData.aveInterval = 1;
    tbData.aveUpdate = false;
    tbData.minMaxInterval = 1;
    tbData.minMaxUpdate = false;
    tbData.sum = 0.0F;
    tbData.time = 0.0F;
    tbData.aveTime = 0.0F;
    initMinMaxData(tbData);
}

void PerfMeasure::initMinMaxData(ProcTimeData& tbData) {
    tbData.minMaxFcnt = 0;
    tbData.maxTime = tbData.curMaxTime = MAX_START;
    tbData.minTime = tbData.curMinTime = MIN_START;
}

void PerfMeasure::avarageProcTime(ProcTimeData& tbData) {
    updateAverage(tbData);
    updateMinMax(tbData);
}
