#include "StageTimes.h"

#include <epoxy/gl.h>

namespace host {

namespace {

constexpr std::array<const char*, 3> NAMES = {"upload", "drawing", "readback"};

} // namespace

StageTimes::StageTimes(int window) : mRecords{} {
    for (size_t i = 0; i < mRecords.size(); ++i) {
        PerfMeasure::initProcTimeData(mRecords[i]);
        mRecords[i].name = NAMES[i];
        mRecords[i].aveInterval = window;
        mRecords[i].minMaxInterval = window;
    }
}

StageTimes::Measurement::Measurement(StageTimes& times, Stage stage)
    : mTimes(times), mRecord(times.mRecords[static_cast<size_t>(stage)]),
      mStart(PerfMeasure::getCurrentTimeInSec()) {}

StageTimes::Measurement::~Measurement() {
    if (mTimes.mIsWaiting)
        glFinish();
    mRecord.time += static_cast<float>((PerfMeasure::getCurrentTimeInSec() - mStart) * 1000.0);
}

void StageTimes::endFrame() {
    for (PerfMeasure::ProcTimeData& record : mRecords) {
        PerfMeasure::avarageProcTime(record);
        record.time = 0.0F;
    }
}

} // namespace host
