// The message and question texts the user is shown, by index.
#pragma once

#include <array>
#include <string>

namespace zx917 {

inline constexpr int kTextCount = 17;

struct TextTables {
    std::array<std::string, kTextCount> MessageTable;
    std::array<std::string, kTextCount> QuestionTable;
};

// Indexes that the operations show.
enum MessageIndex : int {
    kMsgPortMissing = 0,
    kMsgPortUnavailable = 2,
    kMsgCurrentIsNewer = 4,
    kMsgDownloadFailed = 5,
    kMsgCouldNotRead = 6,
    kMsgNotDownloadFile = 8,
    kMsgHardwareChange = 10,
};
enum QuestionIndex : int {
    kQstQuit = 0,
    kQstStart = 2,
    kQstExit = 3,
};

void InitMessages(TextTables& tables);

}  // namespace zx917
