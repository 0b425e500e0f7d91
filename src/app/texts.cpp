#include "app/texts.h"

namespace zx917 {

void InitMessages(TextTables& t) {
    const std::string crlf = "\r\n";
    t.MessageTable.fill("");
    t.QuestionTable.fill("");
    t.MessageTable[kMsgPortMissing] = std::string("Communication port does not exist,") + crlf +
                                      "possibly because of wrong Comm Port setting" + crlf +
                                      "or RS-232C cable not connected." + crlf +
                                      "Check Comm Port setting and cable connection.";
    t.MessageTable[kMsgPortUnavailable] = "Communication port not available.";
    t.MessageTable[kMsgCurrentIsNewer] =
        std::string("The Current Firmware Revision is newer.") + crlf + "OK to continue?";
    t.MessageTable[kMsgDownloadFailed] = "Download failed.";
    t.MessageTable[kMsgCouldNotRead] = "Could not read file.";
    t.MessageTable[kMsgNotDownloadFile] = "This is not the download file.";
    t.MessageTable[kMsgHardwareChange] =
        std::string("To download this firmware, you need to change the hardware.") + crlf +
        "Did you change the hardware?";
    t.QuestionTable[kQstQuit] = "OK to quit the download?";
    t.QuestionTable[kQstStart] = "OK to start the download?";
    t.QuestionTable[kQstExit] = "OK to exit the download program?";
}

}  // namespace zx917
