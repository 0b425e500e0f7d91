// What the firmware operations change on the wizard's pages; the wizard and the command-line
// front end implement it.
#pragma once

#include <cstdint>
#include <string>

namespace zx917 {

class DownloadView {
public:
    virtual ~DownloadView() = default;
    // The settings page's seven lists, Preset, and page 1's Cancel and Next.
    virtual void setSettingsControlsEnabled(bool enabled) = 0;
    // CurFirmInfo(2): the instrument's revision on the firmware page.
    virtual void setCurrentRevisionLabel(const std::string& text) = 0;
    virtual void setProgressRange(int32_t minimum, int32_t maximum) = 0;
    virtual void setProgressValue(int32_t value) = 0;
    // RedByte(4): transferred bytes.
    virtual void setByteLabel(const std::string& text) = 0;
    // RemTime(2) on the confirmation page, RemTime(4) on the transfer page.
    virtual void setRemainingTime(int page, const std::string& text) = 0;
    virtual void setAnimationPlaying(bool playing) = 0;
    virtual void GoToPage(int page) = 0;
};

}  // namespace zx917
