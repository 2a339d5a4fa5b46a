// The translation of line ends, and the end of a text before the end of its file.

#include "qn/dsc/osdep/TextStream.h"

#include <gtest/gtest.h>

#include <string>

#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {
namespace {

NarrowString NarrowPath(const TemporaryFolder& folder) {
    return NarrowString(folder.System(u"file"));
}

std::string ReadAll(const TemporaryFolder& folder, size_t blockSize) {
    TextStream stream;
    EXPECT_TRUE(stream.OpenForReading(NarrowPath(folder)));
    std::string text;
    std::string block(blockSize, '\0');
    for (size_t got = blockSize; got == blockSize;) {
        got = stream.Read(block.data(), blockSize);
        text.append(block, 0, got);
    }
    return text;
}

TEST(TextStreamOfWindows, ALineFeedIsWrittenBehindAReturn) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(NarrowPath(folder)));
    EXPECT_GE(stream.Put("a\nb\r\n\n"), 0);
    stream.Close();
    EXPECT_EQ(folder.ReadFile("file"), "a\r\nb\r\r\n\r\n");
}

TEST(TextStreamOfWindows, ALongTextIsTranslatedToItsEnd) {
    const TemporaryFolder folder;
    std::string text;
    std::string expected;
    for (int i = 0; i < 20000; ++i) {
        text += "line " + std::to_string(i) + "\n";
        expected += "line " + std::to_string(i) + "\r\n";
    }
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(NarrowPath(folder)));
    EXPECT_GE(stream.Put(text.c_str()), 0);
    stream.Close();
    EXPECT_EQ(folder.ReadFile("file"), expected);
    EXPECT_EQ(ReadAll(folder, 4096), text);
}

TEST(TextStreamOfWindows, AReturnBeforeALineFeedIsLeftOutWhateverTheBlocks) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "ab\r\ncd\r\n\r\ne");
    for (const size_t blockSize : {1u, 2u, 3u, 4u, 5u, 4096u}) {
        EXPECT_EQ(ReadAll(folder, blockSize), "ab\ncd\n\ne") << blockSize;
    }
}

TEST(TextStreamOfWindows, AReturnElsewhereStays) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "a\rb\r\r\nc\r");
    EXPECT_EQ(ReadAll(folder, 4096), "a\rb\r\nc\r");
}

TEST(TextStreamOfWindows, TheByte1AEndsTheText) {
    const TemporaryFolder folder;
    folder.WriteFile("file", std::string("a\0b\nc\x1A"
                                         "d\ne",
                                         9));
    EXPECT_EQ(ReadAll(folder, 4096), std::string("a\0b\nc", 5));
    EXPECT_EQ(ReadAll(folder, 1), std::string("a\0b\nc", 5));
}

}  // namespace
}  // namespace qn::dsc::osdep
