#include <FwZel/PictureRefusal.h>
#include <FwZel/PictureSize.h>
#include <FwZel/PngFile.h>
#include <FwZel/PpmFile.h>
#include <FwZel/RefusalWords.h>
#include <FwZel/VideoTestImage.h>

#include <fixture/PictureFiles.h>

#include <gtest/gtest.h>
#include <zlib.h>

#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <memory>
#include <stdexcept>

namespace {

std::string times(size_t count, char character) {
    return std::string(count, character);
}

struct Answer {
    int result;
    uint32_t width, height, bytesPerColour;

    bool operator==(const Answer& other) const {
        return result == other.result && width == other.width && height == other.height &&
               bytesPerColour == other.bytesPerColour;
    }
};

constexpr Answer REFUSED = {-1, 7, 8, 9};

std::ostream& operator<<(std::ostream& out, const Answer& answer) {
    return out << answer.result << ": " << answer.width << " x " << answer.height << ", "
               << answer.bytesPerColour;
}

Answer ask(const std::string& path) {
    Answer answer = {0, 7, 8, 9};
    answer.result =
        VideoTestImage::getWidthHeightFromFile(path, &answer.width, &answer.height, &answer.bytesPerColour);
    return answer;
}

const char* const NO_MAGIC = "it does not start with P6, the sign of a binary PPM file";
const char* const NO_SIZE =
    "its header has no width and height, two numbers above 0 on a line with one space between";
const char* const LONG_LINE = "a line of its header is longer than 255 characters";

TEST(PpmHeader, EveryLayoutIsReadOrRefusedAsDefined) {
    struct Case {
        std::string content;
        Answer answer;
        std::string refusal;
    };
    const Case cases[] = {
        {"P6\n# made by hand\n640 480\n255\nabc", {0, 640, 480, 1}, ""},
        {"#\n#\nP6 whatever\n#\n1 2\n#\n65535\n", {0, 1, 2, 2}, ""},
        {"P6\n1 2\n65535 \n", {0, 1, 2, 1}, ""},
        {"P6\n1 2\n65535\r\n", {0, 1, 2, 1}, ""},
        {"P6\n1 2\n65535", {0, 1, 2, 2}, ""},
        {"P6\r\n1920 1080\r\n255\r\n", {0, 1920, 1080, 1}, ""},
        {"P6\n1920  1080\n255\n", {0, 1920, 1080, 1}, ""},
        {"P6\n1920\t1080\n255\n", {0, 1920, 0, 1}, NO_SIZE},
        {"P6\n1920\n1080\n255\n", {0, 1920, 0, 1}, NO_SIZE},
        {"P6\n\n255\n", {0, 0, 0, 1}, NO_SIZE},
        {"P6", {0, 0, 0, 1}, NO_SIZE},
        {"P6\n12 34", {0, 12, 34, 1}, ""},
        {"P6\n12 34\n# the end within a comment", {0, 12, 34, 1}, ""},
        {"P6\n12 34 # no comment\n#\n255\n", {0, 12, 34, 1}, ""},
        {"P6\n-1 4294967295\n255\n",
         {0, 4294967295U, 4294967295U, 1},
         tooLargeInWords(4294967295U, 4294967295U)},
        {"P6\n65536 65536\n255\n",
         {0, 65536, 65536, 1},
         "its 65536 x 65536 pixels of four bytes reach 2 GiB, more than a texture holds"},
        {"P6\n32768 16384\n255\n", {0, 32768, 16384, 1}, tooLargeInWords(32768, 16384)},
        {"P6\n32768 16383\n255\n", {0, 32768, 16383, 1}, ""},
        {"", REFUSED, NO_MAGIC},
        {"P3\n1 2\n255\n", REFUSED, NO_MAGIC},
        {" P6\n1 2\n255\n", REFUSED, NO_MAGIC},
        {"# nothing but a comment", REFUSED, NO_MAGIC},
        {times(300, '\xFF'), REFUSED, NO_MAGIC},
        {"#" + times(254, 'x') + "\nP6" + times(253, 'x') + "\n12" + times(252, ' ') + "3\n255", // 255 each
         {0, 12, 3, 1},
         ""},
        {"#" + times(255, 'x') + "\nP6\n1 2\n255\n", REFUSED, LONG_LINE},
        {"P6" + times(254, 'x') + "\n1 2\n255\n", REFUSED, LONG_LINE},
        {"P6\n1 2" + times(253, ' ') + "\n255\n", REFUSED, LONG_LINE},
        {"P6\n1 2\n" + times(256, '2'), REFUSED, LONG_LINE},
    };
    for (const auto& [content, answer, refusal] : cases) {
        SCOPED_TRACE(content);
        const TemporaryFile file("picture.ppm", bytesOf(content));
        EXPECT_EQ(ask(file.path()), answer);
        EXPECT_EQ(pictureRefusal(file.path()), refusal);
    }
}

class HeaderLines : public ::testing::Test {
protected:
    void open(const std::string& content) {
        mFile.write(bytesOf(content));
        mStream.reset(std::fopen(mFile.path().c_str(), "rb"));
    }

    std::string line(char delimiter = '\n') {
        char text[256];
        EXPECT_EQ(getLine(mStream.get(), text, delimiter), 0);
        return text;
    }

    std::string effectiveLine() {
        char text[256];
        EXPECT_EQ(getEffectiveLine(mStream.get(), text, '\n'), 0);
        return text;
    }

    struct Closer {
        void operator()(FILE* stream) const { std::fclose(stream); }
    };
    TemporaryFile mFile = TemporaryFile("lines");
    std::unique_ptr<FILE, Closer> mStream;
};

TEST_F(HeaderLines, EndAtTheDelimiterOrTheEndOfTheFile) {
    open("one\n\n\xFFtwo,three\nfour");
    EXPECT_EQ(line(), "one");
    EXPECT_EQ(line(), "");
    EXPECT_EQ(line(','), "\xFFtwo");
    EXPECT_EQ(line(), "three");
    EXPECT_EQ(line(), "four");
    EXPECT_EQ(line(), "");
    open("a\xFF\nb");
    EXPECT_EQ(line('\xFF'), "a") << "a delimiter above 127";
    EXPECT_EQ(line('\xFF'), "\nb");
}

TEST_F(HeaderLines, KeepTheFirst255CharactersOfALongerLine) {
    open(times(255, 'a') + "\n" + times(256, 'b') + "\n" + times(1000, 'c') + "\nrest");
    EXPECT_EQ(line(), times(255, 'a'));
    EXPECT_EQ(line(), times(255, 'b'));
    EXPECT_EQ(line(), times(255, 'c'));
    EXPECT_EQ(line(), "rest");
}

TEST_F(HeaderLines, SkipComments) {
    open("#one\n" + ("#" + times(600, 'x')) + "\n two\n#three\n\n#four");
    EXPECT_EQ(effectiveLine(), " two");
    EXPECT_EQ(effectiveLine(), "");
    EXPECT_EQ(effectiveLine(), "") << "the end of the file within a comment";
    char comment[] = "#";
    char text[] = " #";
    char empty[] = "";
    EXPECT_EQ(detComment(comment), 1);
    EXPECT_EQ(detComment(text), 0);
    EXPECT_EQ(detComment(empty), 0);
}

// A directory opens like a file; the first read fails. The process ends by exit(), so its handlers run.
TEST(StreamErrorDeathTest, EndsTheProcessWithStatus1) {
    const TemporaryFile folder("folder.ppm");
    std::filesystem::create_directory(folder.path());
    EXPECT_EXIT(ask(folder.path()), ::testing::ExitedWithCode(1), "");
    EXPECT_EXIT(
        {
            char text[256];
            FILE* const stream = std::fopen("/dev/null", "wb");
            std::fgetc(stream); // sets the error indicator: the stream is for writing
            getLine(stream, text, '\n');
        },
        ::testing::ExitedWithCode(1), "");
    EXPECT_EQ(pictureRefusal(folder.path()), "it cannot be read: Is a directory");
}

TEST(PictureFiles, ExtensionChoosesTheReader) {
    const Bytes png = PngPicture().encode();
    const Bytes ppm = bytesOf("P6\n3 4\n255\n");
    EXPECT_EQ(ask(TemporaryFile("a.png", png).path()), (Answer{0, 13, 11, 1}));
    EXPECT_EQ(ask(TemporaryFile("a.ppm", ppm).path()), (Answer{0, 3, 4, 1}));
    EXPECT_EQ(ask(TemporaryFile(".ppm", ppm).path()), (Answer{0, 3, 4, 1}));
    EXPECT_EQ(ask(TemporaryFile("a.ppm", png).path()), REFUSED);
    EXPECT_EQ(ask(TemporaryFile("a.png", ppm).path()), REFUSED);
    EXPECT_EQ(ask(".ppm"), REFUSED) << "a name of four characters, and no such file";
    for (const char* name : {"a.PNG", "a.Ppm", "a.jpg", "a.png ", "a.ppm.gz", "apng"}) {
        SCOPED_TRACE(name);
        const TemporaryFile file(name, png);
        EXPECT_EQ(ask(file.path()), (Answer{0, 7, 8, 9}));
        EXPECT_EQ(pictureRefusal(file.path()), "its name ends neither in .png nor in .ppm (in lower case)");
        VideoTestImage::fillTextureFile(file.path(), nullptr, 0, 2, 0, false); // does nothing at all
    }
    for (const char* name : {"", "ab", "ppm"}) {
        SCOPED_TRACE(name);
        EXPECT_THROW(ask(name), std::out_of_range);
        EXPECT_THROW(VideoTestImage::fillTextureFile(name, nullptr, 0, 2, 0, false), std::out_of_range);
        EXPECT_EQ(pictureRefusal(name), "its name is too short for an extension");
    }
}

TEST(PictureFiles, RefusalSaysWhatIsWrongWithAFile) {
    const std::string missing = "it cannot be opened: No such file or directory";
    EXPECT_EQ(pictureRefusal("/no/such/folder/picture.png"), missing);
    EXPECT_EQ(pictureRefusal("/no/such/folder/picture.ppm"), missing);
    EXPECT_EQ(ask("/no/such/folder/picture.png"), REFUSED);

    const TemporaryFile file("picture.png");
    const auto refusalOf = [&file](const Bytes& content) {
        file.write(content);
        return pictureRefusal(file.path());
    };
    const Bytes whole = PngPicture().encode();
    EXPECT_EQ(refusalOf(whole), "");
    EXPECT_EQ(refusalOf({}), "it does not start with the PNG signature");
    EXPECT_EQ(refusalOf(Bytes(whole.begin(), whole.begin() + 7)), "it does not start with the PNG signature");
    const std::string damaged = "its header is damaged (libpng: "; // what libpng says depends on its version
    EXPECT_EQ(refusalOf(Bytes(whole.begin(), whole.begin() + 20)).substr(0, damaged.length()), damaged);

    const auto refusalOfSize = [&refusalOf, whole](uint32_t width, uint32_t height) {
        Bytes png = whole;
        declareSize(png, width, height);
        return refusalOf(png);
    };
    EXPECT_EQ(refusalOfSize(1000000, 536), "");
    EXPECT_EQ(refusalOfSize(1000000, 537), tooLargeInWords(1000000, 537));
    EXPECT_EQ(refusalOfSize(1000001, 1).substr(0, damaged.length()), damaged);
    EXPECT_EQ(refusalOfSize(0xFFFFFFFF, 0xFFFFFFFF).substr(0, damaged.length()), damaged);

    const TemporaryFile folder("folder.png");
    std::filesystem::create_directory(folder.path());
    EXPECT_EQ(pictureRefusal(folder.path()), "it cannot be read: Is a directory");
    EXPECT_EQ(ask(folder.path()), REFUSED);
}

TEST(PictureFiles, SizesAreMultipliedWithoutWrapping) {
    EXPECT_TRUE(pictureFits(0, 0xFFFFFFFF, 8));
    EXPECT_TRUE(pictureFits(0xFFFFFFFF, 0xFFFFFFFF, 0));
    EXPECT_TRUE(pictureFits(0x7FFFFFFF, 1, 1));
    EXPECT_FALSE(pictureFits(0x80000000, 1, 1));
    EXPECT_TRUE(pictureFits(0x1FFFFFFF, 1, 4));
    EXPECT_FALSE(pictureFits(0x20000000, 1, 4));
    EXPECT_TRUE(pictureFits(32768, 16383, 4));
    EXPECT_FALSE(pictureFits(32768, 16384, 4));
    EXPECT_FALSE(pictureFits(65536, 65536, 4));
    EXPECT_FALSE(pictureFits(0xFFFFFFFF, 0xFFFFFFFF, 0xFFFFFFFF));
}

/// Peak memory of a process that does this, in bytes.
template <class Work>
int64_t peakMemory(Work work) {
    const pid_t child = fork();
    if (child == 0) {
        work();
        _exit(0);
    }
    int status = -1;
    rusage usage = {};
    wait4(child, &status, 0, &usage);
    EXPECT_EQ(status, 0);
    return int64_t{usage.ru_maxrss} * 1024;
}

// Twenty texts of 140 KB in all that would unfold to 140 MB.
TEST(PictureFiles, CompressedTextsAreNotUnfolded) {
    Bytes text = bytesOf("Comment");
    text.resize(text.size() + 2); // end of the keyword, compression method
    const Bytes unfolded(7000000, 'x');
    uLongf size = compressBound(unfolded.size());
    const size_t start = text.size();
    text.resize(start + size);
    ASSERT_EQ(compress2(&text[start], &size, unfolded.data(), unfolded.size(), 9), Z_OK);
    text.resize(start + size);
    Bytes png = PngPicture().encode();
    const Bytes chunk = pngChunk("zTXt", text);
    constexpr ptrdiff_t HEADER_END = 33;
    for (int i = 0; i < 20; ++i)
        png.insert(png.begin() + HEADER_END, chunk.begin(), chunk.end());
    const TemporaryFile file("picture.png", png);
    const int64_t base = peakMemory([] {});
    const int64_t peak = peakMemory([&file] {
        if (ask(file.path()).result != 0)
            _exit(1);
    });
    EXPECT_LT(peak - base, 16 << 20);
}

} // namespace
