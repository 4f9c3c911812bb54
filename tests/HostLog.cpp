#include <fixture/TemporaryFile.h>

#include <FwZel/kxsys_syslog.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include <fcntl.h>
#include <unistd.h>

namespace {

/// Sends standard error to a file as long as it lives.
class StandardErrorTo {
public:
    explicit StandardErrorTo(const std::string& path) : mReal(dup(STDERR_FILENO)) {
        const int file = open(path.c_str(), O_CREAT | O_WRONLY | O_APPEND | O_CLOEXEC, 0600);
        dup2(file, STDERR_FILENO);
        close(file);
    }
    ~StandardErrorTo() {
        dup2(mReal, STDERR_FILENO);
        close(mReal);
    }
    StandardErrorTo(const StandardErrorTo&) = delete;
    StandardErrorTo& operator=(const StandardErrorTo&) = delete;

private:
    int mReal;
};

std::vector<std::string> logged(const std::function<void()>& work) {
    const TemporaryFile file("log");
    {
        const StandardErrorTo redirected(file.path());
        work();
    }
    std::ifstream lines(file.path());
    std::vector<std::string> log;
    for (std::string line; std::getline(lines, line);)
        log.push_back(line);
    return log;
}

/// The text with every digit as 0.
std::string shapeOf(std::string text) {
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c >= '0' && c <= '9'; }, '0');
    return text;
}

TEST(HostLog, ALineHasTimeSeverityAndTheFormattedText) {
    const std::string longName(5000, 'x');
    const std::vector<std::string> log = logged([&] {
        kxsys_syslog(3, "GPUR 458: mPboPtrs[%d] = %s\n", 7, "NULL");
        kxsys_syslog(9, "%s", longName.c_str());
    });
    ASSERT_EQ(log.size(), 2U);
    const size_t timeLength = log[0].find(" error: ");
    ASSERT_NE(timeLength, std::string::npos) << log[0];
    EXPECT_EQ(shapeOf(log[0].substr(0, timeLength)), "0000-00-00 00:00:00.000");
    EXPECT_EQ(log[0].substr(timeLength), " error: GPUR 458: mPboPtrs[7] = NULL");
    EXPECT_EQ(log[1].substr(log[1].find(" level 9: ")), " level 9: " + longName);
}

TEST(HostLog, LinesOfManyThreadsNeverMix) {
    constexpr int NUM_LINES = 500;
    const std::string text(300, 'x');
    const auto write = [&] {
        for (int i = 0; i < NUM_LINES; ++i)
            kxsys_syslog(3, "%s\n", text.c_str());
    };
    const std::vector<std::string> log = logged([&] {
        std::thread first(write);
        std::thread second(write);
        first.join();
        second.join();
    });
    ASSERT_EQ(log.size(), 2U * NUM_LINES);
    for (const std::string& line : log)
        ASSERT_EQ(line.substr(line.find(" error: ")), " error: " + text);
}

} // namespace
