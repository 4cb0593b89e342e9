#include "ulk_tools/raw_stream.h"

#include <gtest/gtest.h>

#include "ulk_tools/test_pattern.h"

using namespace ulk_tools;

namespace {

// A stream holding bytes, positioned at its start.
FILE* StreamWith(const std::string& bytes) {
    FILE* stream = std::tmpfile();
    std::fwrite(bytes.data(), 1, bytes.size(), stream);
    std::rewind(stream);
    return stream;
}

}  // namespace

TEST(RawStream, FramesRoundTripAndTheEndIsClean) {
    FILE* stream = std::tmpfile();
    ASSERT_NE(stream, nullptr);
    std::string error;
    std::vector<Frame> written;
    for (int i = 0; i < 3; ++i) {
        written.emplace_back(5, 3);
        FillTestPattern(&written.back(), i);
        ASSERT_TRUE(WriteRawFrame(stream, written.back(), &error)) << error;
    }
    EXPECT_EQ(std::ftell(stream), 3 * 5 * 3 * 4);  // no header, no padding
    std::rewind(stream);
    Frame frame(5, 3);
    for (int i = 0; i < 3; ++i) {
        ASSERT_EQ(ReadRawFrame(stream, &frame, &error), RawReadResult::kFrame) << error;
        EXPECT_TRUE(frame.SamePixels(written[i])) << "frame " << i;
    }
    EXPECT_EQ(ReadRawFrame(stream, &frame, &error), RawReadResult::kEnd);
    std::fclose(stream);

    FILE* empty = StreamWith("");
    EXPECT_EQ(ReadRawFrame(empty, &frame, &error), RawReadResult::kEnd);
    std::fclose(empty);
}

TEST(RawStream, PartialFramesAndUnsizedFramesAreErrors) {
    std::string error;
    Frame frame(4, 2);  // 32 bytes a frame
    // One whole frame, then 33 bytes: a frame plus one byte is not two frames.
    FILE* stream = StreamWith(std::string(32, 'a') + std::string(33, 'b'));
    EXPECT_EQ(ReadRawFrame(stream, &frame, &error), RawReadResult::kFrame);
    EXPECT_EQ(frame.Pixel(3, 1)[3], 'a');
    EXPECT_EQ(ReadRawFrame(stream, &frame, &error), RawReadResult::kFrame);
    EXPECT_EQ(ReadRawFrame(stream, &frame, &error), RawReadResult::kError);
    EXPECT_NE(error.find("1 of 32 bytes"), std::string::npos) << error;
    std::fclose(stream);

    // Short inside the first row and inside a later row.
    for (size_t size : {size_t{5}, size_t{20}}) {
        FILE* shortStream = StreamWith(std::string(size, 'c'));
        EXPECT_EQ(ReadRawFrame(shortStream, &frame, &error), RawReadResult::kError) << size;
        std::fclose(shortStream);
    }

    Frame unsized;
    FILE* any = StreamWith("abcd");
    EXPECT_EQ(ReadRawFrame(any, &unsized, &error), RawReadResult::kError);
    std::fclose(any);

    // A stream opened only for reading cannot take a frame.
    FILE* readOnly = std::fopen("/dev/null", "rb");
    ASSERT_NE(readOnly, nullptr);
    EXPECT_FALSE(WriteRawFrame(readOnly, frame, &error));
    EXPECT_NE(error.find("raw output"), std::string::npos);
    std::fclose(readOnly);
}
