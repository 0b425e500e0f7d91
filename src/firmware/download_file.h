// The download file: its four sections, and the check that a file is a download file.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>

#include "app/app_state.h"
#include "app/dialogs.h"
#include "app/file_slot.h"
#include "app/texts.h"

namespace zx917 {

struct Section {
    const char* tag;         // header tag
    const char* marker;      // pattern of the section's marker line
    int16_t stage;           // command script stage that carries it
    const char* select;      // select command, answered by the same text
    const char* dataAnswer;  // answer to each record
    const char* endAnswer;   // answer to the end of the area
};

inline constexpr std::array<Section, 4> SectionTable = {{
    {"MDSP:", "*[[]MDSP*", 4, "SP2", "P2A", "EP2"},
    {"CDMA:", "*[[]CDMA*", 5, "SP3", "P3A", "EP3"},
    {"AMPS:", "*[[]AMPS*", 6, "SP4", "P4A", "EP4"},
    {"MPU:", "*[[]MPU]*", 7, "SP1", "P1A", "EP1"},
}};
inline constexpr int kAmpsSection = 2;
inline constexpr int kMinDownloadFileLength = 66;
inline constexpr const char* kEndMarkerPattern = "*EOF]*";

struct FileCheckParts {
    AppState& app;
    FileSlot& file;
    Dialogs& dialogs;
    const TextTables& texts;
};

// True when the file is a download file and the user did not refuse the hardware change.
// An ask flag of 1 asks the hardware-change question; any other value never asks.
bool CheckDownloadFile(const FileCheckParts& parts, const std::string& path, int16_t ask);

// Checks the header tags of the open file and rewinds it. Nothing on a read failure.
std::optional<bool> CheckFileHeader(const FileCheckParts& parts);

}  // namespace zx917
