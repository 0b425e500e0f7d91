// Wildcard matching, revision numbers, filler stripping, byte lengths and the fixed field.
#include <gtest/gtest.h>

#include "app/app_state.h"
#include "app/texts.h"
#include "firmware/revision.h"
#include "link/wildcard.h"

namespace zx917 {
namespace {

TEST(Wildcard_Rules, MatchesWholeTextCaseSensitive) {
    struct Case {
        const char* text;
        const char* pattern;
        bool match;
    };
    const Case cases[] = {
        {"DOWNLOAD READY", "DOWNLOAD READY*", true},
        {"download ready", "DOWNLOAD READY*", false},
        {"DOWNLOAD READ", "DOWNLOAD READY*", false},
        {"P2A", "P2A*", true},
        {"P2AX", "P2A*", true},
        {"xP2A", "P2A*", false},
        {"0,\"No error\"", "*,\"*", true},
        {"0 No error", "*,\"*", false},
        {"[MDSP]", "*[[]MDSP*", true},
        {"junk[MDSP] rev", "*[[]MDSP*", true},
        {"MDSP]", "*[[]MDSP*", false},
        {"[MPU]", "*[[]MPU]*", true},
        {"[MPU", "*[[]MPU]*", false},
        {"EOF]", "*EOF]*", true},
        {"OF]", "*EOF]*", false},
        {"A1", "?#", true},
        {"AB", "?#", false},
        {"A", "?#", false},
        {"b", "[a-c]", true},
        {"d", "[a-c]", false},
        {"d", "[!a-c]", true},
        {"b", "[!a-c]", false},
        {"x", "[xyz]", true},
        {"", "*", true},
        {"", "?", false},
        {"abc", "a*c", true},
        {"abcbc", "a*bc", true},
        {"abcbd", "a*bc", false},
        {"A.HEX", "*.HEX", true},
        {"A.hex", "*.HEX", false},
        {"README", "*.*", false},
        {"[", "[", true},
        {"RESTART:P2", "RESTART:*", true},
        {"xxABORTyy", "*ABORT*", true},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(WildcardMatch(c.text, c.pattern), c.match) << c.text << " ~ " << c.pattern;
    }
}

TEST(RevisionNumber_Values, ReadsNumberFromThirdCharacter) {
    struct Case {
        std::string text;
        double value;
    };
    const Case cases[] = {
        {"A.01.02", 1.02}, {"B.02.10", 2.1}, {"?.??.??", 0.0}, {std::string(7, '\0'), 0.0},
        {"X.XX.XX", 0.0},  {"A. 3.50", 3.5}, {"A.1    ", 1.0}, {"AB", 0.0},
        {"C.10.00", 10.0}, {"A.02.00", 2.0},
    };
    for (const Case& c : cases) EXPECT_DOUBLE_EQ(RevisionNumber(c.text), c.value) << c.text;
    // The newer-or-equal warning compares the digits alone.
    EXPECT_TRUE(CurrentIsNewerOrEqual(Rev7("A.02.00"), Rev7("B.01.00")));
    EXPECT_FALSE(CurrentIsNewerOrEqual(Rev7("B.01.00"), Rev7("A.02.00")));
    EXPECT_TRUE(CurrentIsNewerOrEqual(Rev7("A.01.02"), Rev7("A.01.02")));
    EXPECT_FALSE(CurrentIsNewerOrEqual(Rev7("?.??.??"), Rev7("A.01.02")));
}

TEST(TextHelpers_Fillers, StripAndByteLength) {
    EXPECT_EQ(StripFillers("_A.01 02"), "A.0102");
    EXPECT_EQ(StripFillers("A.01.02"), "A.01.02");
    EXPECT_EQ(StripFillers(std::string(7, '\0')), "");
    EXPECT_EQ(AnsiByteLength(U"LONGNAME.HEX"), 12);
    EXPECT_EQ(AnsiByteLength(U"A\u00e9"), 2);
    EXPECT_EQ(AnsiByteLength(U"A\u65e5"), 3);  // a double-byte character counts 2
    EXPECT_EQ(AnsiByteLength(U"\x01"), 2);     // control characters below 0x10 count 2
    EXPECT_EQ(AnsiByteLengthUtf8("LONGNAME12.HEX"), 14);
    EXPECT_EQ(AnsiByteLengthUtf8("\xc3\xa9.HEX"), 5);
    EXPECT_EQ(AnsiByteLengthUtf8("\xe6\x97\xa5.HEX"), 6);
    EXPECT_EQ(AnsiByteLengthUtf8("\xff"), 2);
}

TEST(Rev7_Field, PadsCutsAndStartsAsNul) {
    AppState app;
    EXPECT_EQ(app.CurrentRevision.str(), std::string(7, '\0'));
    app.NewRevision = "A.01";
    EXPECT_EQ(app.NewRevision.str(), "A.01   ");
    app.NewRevision = "A.01.02XYZ";
    EXPECT_EQ(app.NewRevision.str(), "A.01.02");
}

TEST(Texts_Tables, ExactTextsAtTheirIndexes) {
    TextTables t;
    InitMessages(t);
    EXPECT_EQ(t.MessageTable[0],
              "Communication port does not exist,\r\npossibly because of wrong Comm Port "
              "setting\r\nor RS-232C cable not connected.\r\nCheck Comm Port setting and cable "
              "connection.");
    EXPECT_EQ(t.MessageTable[2], "Communication port not available.");
    EXPECT_EQ(t.MessageTable[4], "The Current Firmware Revision is newer.\r\nOK to continue?");
    EXPECT_EQ(t.MessageTable[5], "Download failed.");
    EXPECT_EQ(t.MessageTable[6], "Could not read file.");
    EXPECT_EQ(t.MessageTable[8], "This is not the download file.");
    EXPECT_EQ(t.MessageTable[10],
              "To download this firmware, you need to change the hardware.\r\nDid you change the "
              "hardware?");
    EXPECT_EQ(t.QuestionTable[0], "OK to quit the download?");
    EXPECT_EQ(t.QuestionTable[2], "OK to start the download?");
    EXPECT_EQ(t.QuestionTable[3], "OK to exit the download program?");
    int filled = 0;
    for (int i = 0; i < kTextCount; ++i)
        filled += !t.MessageTable[i].empty() + !t.QuestionTable[i].empty();
    EXPECT_EQ(filled, 10);
}

TEST(Defaults_Start, SerialDefaultsAndFolders) {
    AppState app;
    InitDefaults(app, "/opt/zx917");
    EXPECT_EQ(app.PortSettings, "9600,n,8,1");
    EXPECT_EQ(app.Terminator, "\r\n");
    EXPECT_EQ(app.HexFolder, "/opt/zx917/HEX");
    EXPECT_EQ(app.ScriptStep, 9);
}

}  // namespace
}  // namespace zx917
