// The chooser's name rules without a window: what the name and type boxes take from keys and
// from pasted text, which names a folder lists, and which real file a typed name opens.
#include "firmware/file_choice.h"

#include <gtest/gtest.h>

#include "firmware/revision.h"

namespace zx917 {
namespace {

TEST(FileChoice_Boxes, TextTakenAsTypingItWouldGive) {
    struct Case {
        const char* name;
        bool typeBox;
        std::u32string previous, proposed, taken;
    };
    const Case cases[] = {
        {"upper case", false, U"", U"a.hex", U"A.HEX"},
        {"Latin-1 letters", false, U"", U"\u00e9t\u00e9.hex", U"\u00c9T\u00c9.HEX"},
        {"name box refuses * space / : \\", false, U"", U"A B*.HEX/:\\", U"AB.HEX"},
        {"a key typed at the end", false, U"A.HE", U"A.HEx", U"A.HEX"},
        {"a refused key over a selection changes nothing", false, U"A.HEX", U"*", U"A.HEX"},
        {"control characters never arrive", false, U"", U"A\t.\nHEX", U"A.HEX"},
        {"type box takes a star", true, U"", U"s* x", U"S*X"},
        {"type box stops at 12 bytes", true, U"", U"ABCDEFGHIJKLMN", U"ABCDEFGHIJKL"},
        {"underscores and spaces do not count", true, U"", U"A_B_C_DEFGHIJKLMNO",
         U"A_B_C_DEFGHIJKL"},
        {"full: a key is refused", true, U"ABCDEFGHIJKL", U"ABCDEFGHIJKLZ", U"ABCDEFGHIJKL"},
        {"full: so is an underscore", true, U"ABCDEFGHIJKL", U"ABCDEFGHIJKL_", U"ABCDEFGHIJKL"},
        {"deleting is always taken", true, U"ABCDEFGHIJKL", U"ABCDEFGHIJK", U"ABCDEFGHIJK"},
        {"typed in the middle", true, U"*.HX", U"*.HeX", U"*.HEX"},
        {"an item replaces the text", true, U"ABCDEFGHIJKL", U"*.*", U"*.*"},
        {"a wide character counts two bytes", true, U"ABCDEFGHIJ", U"ABCDEFGHIJ\u65e5Z",
         U"ABCDEFGHIJ\u65e5"},
    };
    for (const Case& c : cases) {
        const auto taken =
            c.typeBox ? RetFileText(c.previous, c.proposed) : FileNameText(c.previous, c.proposed);
        EXPECT_EQ(EncodeUtf8(taken), EncodeUtf8(c.taken)) << c.name;
    }
    // Enter and Backspace pass the key rules as they are.
    EXPECT_EQ(RetFileKey(U"ABCDEFGHIJKL", 8), 8u);
    EXPECT_EQ(RetFileKey(U"ABCDEFGHIJKL", 13), 13u);
    EXPECT_EQ(FileNameKey(13), 13u);
    EXPECT_FALSE(FileNameKey('*'));
    EXPECT_EQ(RetFileKey(U"", '*'), U'*');
}

TEST(FileChoice_List, PatternLengthCaseAndTheRealName) {
    struct Case {
        const char* name;
        std::vector<std::string> names;
        std::string pattern;
        std::vector<std::pair<std::string, std::string>> listed;  // real name, shown
    };
    const std::vector<std::string> folder = {"a.hex", "Readme", "LONGNAME12.HEX", "B.BIN"};
    const Case cases[] = {
        {"*.HEX", folder, "*.HEX", {{"a.hex", "A.HEX"}}},
        {"*.* needs a point", folder, "*.*", {{"a.hex", "A.HEX"}, {"B.BIN", "B.BIN"}}},
        {"*", folder, "*", {{"a.hex", "A.HEX"}, {"Readme", "README"}, {"B.BIN", "B.BIN"}}},
        {"lower-case pattern matches nothing", folder, "*.hex", {}},
        {"one entry per name, the exact one opened",
         {"two.hex", "TWO.HEX", "Two.Hex"},
         "*.HEX",
         {{"TWO.HEX", "TWO.HEX"}}},
        {"one entry per name, else the first",
         {"two.hex", "Two.Hex"},
         "*.HEX",
         {{"two.hex", "TWO.HEX"}}},
        {"? is one character", {"\xc3\xa9.hex"}, "?.HEX", {{"\xc3\xa9.hex", "\xc3\x89.HEX"}}},
        {"12 bytes of Latin-1",
         {"ABCDEFG\xc3\xa9.HEX"},
         "*",
         {{"ABCDEFG\xc3\xa9.HEX", "ABCDEFG\xc3\x89.HEX"}}},
        {"not valid UTF-8 still listed", {"\xff.hex"}, "*.HEX", {{"\xff.hex", "\xef\xbf\xbd.HEX"}}},
        {"# is a digit", {"F1.HEX", "FX.HEX"}, "F#.HEX", {{"F1.HEX", "F1.HEX"}}},
    };
    for (const Case& c : cases) {
        std::vector<std::pair<std::string, std::string>> got;
        for (const ListedName& n : ListedFileNames(c.names, c.pattern))
            got.emplace_back(n.name, n.shown);
        EXPECT_EQ(got, c.listed) << c.name;
    }
    EXPECT_EQ(SameNameRegardlessOfCase({"x.hex", "lower.hex"}, "LOWER.HEX"), "lower.hex");
    EXPECT_EQ(SameNameRegardlessOfCase({"\xff.hex"}, "\xef\xbf\xbd.HEX"), "\xff.hex");
    EXPECT_FALSE(SameNameRegardlessOfCase({"x.hex"}, "Y.HEX"));
}

}  // namespace
}  // namespace zx917
