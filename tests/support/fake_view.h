// A view that keeps what the firmware operations showed.
#pragma once

#include <string>
#include <vector>

#include "firmware/download_view.h"

namespace zx917::test {

class FakeView : public DownloadView {
public:
    void setSettingsControlsEnabled(bool enabled) override { enabledHistory.push_back(enabled); }
    void setCurrentRevisionLabel(const std::string& text) override { currentRevision = text; }
    void setProgressRange(int32_t minimum, int32_t maximum) override {
        progressMin = minimum;
        progressMax = maximum;
    }
    void setProgressValue(int32_t value) override { progressValues.push_back(value); }
    void setByteLabel(const std::string& text) override { byteLabels.push_back(text); }
    void setRemainingTime(int page, const std::string& text) override {
        (page == 2 ? remTime2 : remTime4) = text;
    }
    void setAnimationPlaying(bool playing) override { animation.push_back(playing); }
    void GoToPage(int page) override { pages.push_back(page); }

    std::vector<bool> enabledHistory;
    std::string currentRevision;
    int32_t progressMin = -1;
    int32_t progressMax = -1;
    std::vector<int32_t> progressValues;
    std::vector<std::string> byteLabels;
    std::string remTime2;
    std::string remTime4;
    std::vector<bool> animation;
    std::vector<int> pages;
};

}  // namespace zx917::test
