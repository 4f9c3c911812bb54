#include <FwZel/PerfMeasure.h>

#include <gtest/gtest.h>

#include <ctime>
#include <vector>

namespace {

using Record = PerfMeasure::ProcTimeData;

constexpr float MIN_START = 1000000.0F;

/// A record in which every field that initProcTimeData() sets has another value.
Record usedRecord() {
    return {"upload", 7, 8, true, 9, 10, true, 11, 12, 13, 14, 15, 16, 17};
}

Record freshRecord(int aveInterval, int minMaxInterval) {
    Record record = usedRecord();
    PerfMeasure::initProcTimeData(record);
    record.aveInterval = aveInterval;
    record.minMaxInterval = minMaxInterval;
    return record;
}

void expectMinMaxWindowRestarted(const Record& record) {
    EXPECT_EQ(record.minMaxFcnt, 0);
    EXPECT_EQ(record.maxTime, 0.0F);
    EXPECT_EQ(record.curMaxTime, 0.0F);
    EXPECT_EQ(record.minTime, MIN_START);
    EXPECT_EQ(record.curMinTime, MIN_START);
}

TEST(PerformanceWindows, InitialisationResetsAllButTheName) {
    Record record = usedRecord();
    PerfMeasure::initProcTimeData(record);
    EXPECT_EQ(record.name, "upload");
    EXPECT_EQ(record.aveFcnt, 0);
    EXPECT_EQ(record.aveInterval, 1);
    EXPECT_EQ(record.minMaxInterval, 1);
    EXPECT_FALSE(record.aveUpdate);
    EXPECT_FALSE(record.minMaxUpdate);
    EXPECT_EQ(record.sum, 0.0F);
    EXPECT_EQ(record.time, 0.0F);
    EXPECT_EQ(record.aveTime, 0.0F);
    expectMinMaxWindowRestarted(record);
}

TEST(PerformanceWindows, MinMaxRestartLeavesAverageIntervalAndFlagAlone) {
    Record record = usedRecord();
    PerfMeasure::initMinMaxData(record);
    expectMinMaxWindowRestarted(record);
    EXPECT_EQ(record.aveFcnt, 7);
    EXPECT_EQ(record.minMaxInterval, 10);
    EXPECT_TRUE(record.minMaxUpdate);
    EXPECT_EQ(record.sum, 11.0F);
    EXPECT_EQ(record.time, 12.0F);
    EXPECT_EQ(record.aveTime, 13.0F);
}

struct AverageStep {
    float time;
    bool closes;
    float aveTime;
    float sum;
    int frames;
};

void expectAverages(int interval, const std::vector<AverageStep>& steps) {
    Record record = freshRecord(interval, 0);
    for (const AverageStep& step : steps) {
        SCOPED_TRACE(step.time);
        record.time = step.time;
        PerfMeasure::avarageProcTime(record);
        EXPECT_EQ(record.aveUpdate, step.closes);
        EXPECT_EQ(record.aveTime, step.aveTime);
        EXPECT_EQ(record.sum, step.sum);
        EXPECT_EQ(record.aveFcnt, step.frames);
    }
}

TEST(PerformanceWindows, AverageClosesAfterItsInterval) {
    expectAverages(3, {{1, false, 0, 1, 1},
                       {2, false, 0, 3, 2},
                       {3, true, 2, 0, 0},
                       {8, false, 2, 8, 1},
                       {0, false, 2, 8, 2},
                       {0, true, 8.0F / 3.0F, 0, 0}});
}

TEST(PerformanceWindows, AverageIntervalBelowOneWorksAsOne) {
    expectAverages(0, {{4, true, 4, 0, 0}, {5, true, 5, 0, 0}});
    expectAverages(-3, {{4, true, 4, 0, 0}});
}

struct MinMaxStep {
    float time;
    bool closes;
    float maxTime, minTime, curMaxTime, curMinTime;
};

void expectExtremes(int interval, const std::vector<MinMaxStep>& steps) {
    Record record = freshRecord(1, interval);
    for (const MinMaxStep& step : steps) {
        SCOPED_TRACE(step.time);
        record.time = step.time;
        PerfMeasure::avarageProcTime(record);
        EXPECT_EQ(record.minMaxUpdate, step.closes);
        EXPECT_EQ(record.maxTime, step.maxTime);
        EXPECT_EQ(record.minTime, step.minTime);
        EXPECT_EQ(record.curMaxTime, step.curMaxTime);
        EXPECT_EQ(record.curMinTime, step.curMinTime);
    }
}

TEST(PerformanceWindows, ExtremesFollowTheWindowAndRestartWhenItCloses) {
    // In the second window a maximum below, and a minimum above, those of the first replace them.
    expectExtremes(2, {{5, false, 5, 5, 5, 5},
                       {3, true, 5, 3, 0, MIN_START},
                       {4, false, 4, 4, 4, 4},
                       {4, true, 4, 4, 0, MIN_START}});
}

TEST(PerformanceWindows, TimesAtTheStartValuesCountAsNeither) {
    expectExtremes(1, {{0, true, 0, 0, 0, MIN_START}, {MIN_START, true, MIN_START, MIN_START, 0, MIN_START}});
    expectExtremes(1, {{2000000, true, 2000000, MIN_START, 0, MIN_START}});
}

TEST(PerformanceWindows, MinMaxIntervalBelowOneNeverCloses) {
    for (const int interval : {0, -1})
        expectExtremes(interval, {{5, false, 5, 5, 5, 5}, {3, false, 5, 3, 5, 3}, {9, false, 9, 3, 9, 3}});
}

TEST(PerformanceWindows, TimeIsTheRealTimeClockWithItsFraction) {
    const auto seconds = [] {
        timespec now{};
        clock_gettime(CLOCK_REALTIME, &now);
        return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
    };
    const double before = seconds();
    const double time = PerfMeasure::getCurrentTimeInSec();
    EXPECT_LE(before, time);
    EXPECT_LE(time, seconds());
}

} // namespace
