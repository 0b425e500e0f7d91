// Every caption and static text of the three windows, by window and control name, as the
// message boxes' texts are by index. Line breaks are "\n".
#pragma once

#include <array>
#include <string_view>

namespace zx917 {

struct Caption {
    std::string_view window;   // "FrmMain" (the wizard and its settings page) or "FrmNewSel"
    std::string_view control;  // the control's name, an index set's member as "CmdNext_3"
    std::string_view text;
};

inline constexpr std::string_view kInstructionsText =
    "This is a program to download the Quorvex ZX917 Firmware by using RS-232C\n"
    "communication.\n"
    "\n"
    "  1. On the ZX917, press the \"PRESET\" key, then press the\n"
    "     \"CONFIGURATION\" softkey. (Go to the CONFIGURATION Screen.)\n"
    "  2. Connect the \"SERIAL INTERFACE\" port on the back left side of the\n"
    "      ZX917 and the Comm Port of your PC with RS-232C cross cable.\n"
    "      Be careful not to use the \"SERVICE USE ONLY\" port.\n"
    "     (Quorvex Technologies recommends Quorvex VN6120 RS232 Cable Kit )\n"
    "  3. After checking the connection, click \"Next>\"";

inline constexpr auto kCaptions = std::to_array<Caption>({
    // The wizard's button rows.
    {"FrmMain", "CmdNext_0", "&Next >"},
    {"FrmMain", "CmdNext_1", "&Next >"},
    {"FrmMain", "CmdNext_2", "&Next >"},
    {"FrmMain", "CmdNext_3", "&Execute >"},
    {"FrmMain", "CmdNext_5", "&Confirm"},
    {"FrmMain", "CmdBack_3", "<&Back"},
    {"FrmMain", "CmdExit", "&Cancel"},
    {"FrmMain", "CmdHelp", "&Help"},
    // Page 0.
    {"FrmMain", "Label12_2", kInstructionsText},
    // Page 1, the settings.
    {"FrmMain", "Label7_1",
     "Select the Comm Port and set the settings to be same as the\nZX917's serial port "
     "settings."},
    {"FrmMain", "Label3", "Comm Port:"},
    {"FrmMain", "Frame3", "Settings"},
    {"FrmMain", "Label1_1", "Baud Rate:"},
    {"FrmMain", "Label2_1", "Data Length:"},
    {"FrmMain", "Label9_1", "Stop Bits:"},
    {"FrmMain", "Label10", "Parity:"},
    {"FrmMain", "Label4_0", "Xcontrol:"},
    {"FrmMain", "Label4_1", "Terminator:"},
    {"FrmMain", "cmdReset", "&Preset"},
    // Page 2.
    {"FrmMain", "Frame1", "Current Firmware Information"},
    {"FrmMain", "Frame2", "New Firmware Information"},
    {"FrmMain", "CmdFirmSelect", "&Select the Download File\nfor the New Firmware"},
    // The summary of pages 3 to 5 and the brackets around file names.
    {"FrmMain", "Label1", "Current Firmware"},
    {"FrmMain", "Label2", "New Firmware"},
    {"FrmMain", "OpenBracket", "("},
    {"FrmMain", "CloseBracket", ")"},
    // Page 3.
    {"FrmMain", "Label6", "To start the download, click the Execute button."},
    {"FrmMain", "Label7_0", "Download time:"},
    // Page 4.
    {"FrmMain", "Label5_2", "Downloading....\nDO NOT turn off the ZX917 or PC!"},
    {"FrmMain", "Label11_1", "Progress"},
    {"FrmMain", "Label8_0", "Transferred bytes:"},
    {"FrmMain", "Label7_2", "Remaining time:"},
    // Page 5.
    {"FrmMain", "Label12_0", "Download successfully completed."},
    // The file chooser.
    {"FrmNewSel", "FrmNewSel", "Open"},
    {"FrmNewSel", "Label1", "Lookin:"},
    {"FrmNewSel", "Label2", "File Name:"},
    {"FrmNewSel", "Label3", "File of type:"},
    {"FrmNewSel", "OpenCom", "&Open"},
    {"FrmNewSel", "CanselCom", "&Cancel"},
    {"FrmNewSel", "Frame1", "Firmware REV"},
    {"FrmNewSel", "Label6", "Current:"},
    {"FrmNewSel", "Label4", "New:"},
});

// The caption of a control; empty when it has none.
constexpr std::string_view CaptionOf(std::string_view window, std::string_view control) {
    for (const Caption& c : kCaptions) {
        if (c.window == window && c.control == control) return c.text;
    }
    return {};
}

}  // namespace zx917
