#include <gtest/gtest.h>

#include "framework/NodeTree.h"

using KO::pathToText;
using KO::textToPath;

TEST(NodePath, IsUnchangedIfItIsPlain) {
    EXPECT_EQ(pathToText("/system/computer"), "/system/computer");
    EXPECT_EQ(pathToText("Az09./:-"), "Az09./:-");
    EXPECT_EQ(pathToText(""), "");
}

TEST(NodePath, EncodesBlanksAndUnderscores) {
    EXPECT_EQ(pathToText("/rack 1/host_2\t\n%"), "/rack%201/host%5F2%09%0A%25");
    EXPECT_EQ(pathToText("\xC3\xA9"), "%C3%A9");
}

TEST(NodePath, IsDecodedFromItsString) {
    std::string everyByte;
    for (int byte = 0; byte < 256; ++byte) {
        everyByte += static_cast<char>(byte);
    }
    const std::string text = pathToText(everyByte);
    EXPECT_EQ(textToPath(text), everyByte);
    EXPECT_EQ(text.find_first_of(" \t\r\n\v\f_"), std::string::npos);
}

TEST(NodePath, ReturnsInvalidEncodingsUnchanged) {
    for (const char* text :
         {"L 1", "under_score", "%2f", "%2F", "%41", "%", "%2", "%4", "50%", "%G0", "%0g", "a%20b c"}) {
        EXPECT_EQ(textToPath(text), text);
    }
    EXPECT_EQ(textToPath("a%20b"), "a b");
    EXPECT_EQ(textToPath("%25"), "%");
}
