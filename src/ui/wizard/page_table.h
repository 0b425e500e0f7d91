// Each wizard page's facts in one row: its height, the buttons its row shows and their
// captions, its help topic, the summary block of pages 3 to 5, and its tab stops in tab order.
// Building the pages, showing them, their tab order and help all read this table.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string_view>

#include "app/captions.h"

namespace zx917::ui {

inline constexpr int kPages = 6;

// The summary block: tops of the revisions, the file name box's width, the closing bracket's
// left edge (twips), and the indexes of its captions and brackets in their sets.
struct SummaryRow {
    int curTop, newCaptionTop, newTop, fileWidth, closeBracketLeft;
    int captionIndex, openIndex, closeIndex;
};

struct PageRow {
    int height;             // twips; the page is 8295 wide
    std::string_view next;  // the forward button's caption; empty: none
    std::string_view back;  // the back button's caption; empty: none
    bool cancel;            // "&Cancel"
    int32_t helpContext;    // the topic of its help button
    std::optional<SummaryRow> summary;
    std::array<std::string_view, 11> tabStops;  // control names in tab order; the rest empty
};

inline constexpr std::array<PageRow, kPages> kPageRows = {{
    {4335,
     CaptionOf("FrmMain", "CmdNext_0"),
     {},
     true,
     18,
     std::nullopt,
     {"CmdNext_0", "CmdExit_0", "CmdHelp_0"}},
    {4455,
     CaptionOf("FrmMain", "CmdNext_1"),
     {},
     true,
     19,
     std::nullopt,
     {"cboPort", "cboSpeed", "cboDataBits", "cboStopBits", "cboParity", "cboXon", "cboEoc",
      "cmdReset", "CmdNext_1", "CmdExit_1", "CmdHelp_1"}},
    {4335,
     CaptionOf("FrmMain", "CmdNext_2"),
     {},
     true,
     20,
     std::nullopt,
     {"CmdFirmSelect", "CmdNext_2", "CmdExit_2", "CmdHelp_2"}},
    {4335,
     CaptionOf("FrmMain", "CmdNext_3"),
     CaptionOf("FrmMain", "CmdBack_3"),
     true,
     22,
     SummaryRow{500, 1095, 1104, 1692, 5640, 0, 11, 10},
     {"CmdNext_3", "CmdExit_3", "CmdHelp_3", "CmdBack_3"}},
    {4335, {}, {}, false, 23, SummaryRow{480, 1080, 1104, 1812, 5760, 2, 1, 0}, {"CmdHelp_4"}},
    {4335,
     CaptionOf("FrmMain", "CmdNext_5"),
     {},
     false,
     24,
     SummaryRow{495, 1080, 1100, 1692, 5640, 4, 4, 3},
     {"CmdNext_5", "CmdHelp_5"}},
}};

// F1 on any page opens the help file at its contents.
inline constexpr int32_t kF1Context = 1;

}  // namespace zx917::ui
