// The download's progress on a terminal: one line on stderr, redrawn in place on a terminal,
// plain periodic lines otherwise.
#pragma once

#include <chrono>
#include <string>

#include "firmware/download_view.h"

namespace zx917 {

class CliView : public DownloadView {
public:
    CliView();
    void setSettingsControlsEnabled(bool) override {}
    void setCurrentRevisionLabel(const std::string& text) override { currentRevision = text; }
    void setProgressRange(int32_t minimum, int32_t maximum) override;
    void setProgressValue(int32_t value) override;
    void setByteLabel(const std::string& text) override;
    void setRemainingTime(int page, const std::string& text) override;
    void setAnimationPlaying(bool playing) override;
    void GoToPage(int page) override { lastPage = page; }

    std::string currentRevision;
    std::string estimate;  // RemTime(2)
    int lastPage = -1;

private:
    void draw(bool force = false);

    bool tty_;
    int32_t min_ = 0, max_ = 0, value_ = 0;
    std::string bytes_ = "0Byte", remaining_;
    bool active_ = false;
    std::chrono::steady_clock::time_point lastDraw_{};
    int lastPercent_ = -1;
};

}  // namespace zx917
