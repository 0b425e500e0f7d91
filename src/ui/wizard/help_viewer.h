// The help window: our HTML help file shown at the topic of a context number, in one non-modal
// window of its own that leaves the wizard usable and on its page. It has no owner window, so
// the modal file chooser does not block it either. The file is its source: its anchors,
// links and the back and forward history work as in any browser.
#pragma once

#include <QTextBrowser>
#include <cstdint>
#include <memory>
#include <string>

namespace zx917::ui {

// The anchor of a topic in the help file: <a name="context-18">.
QString HelpAnchor(int32_t context);

class HelpViewer {
public:
    HelpViewer() = default;

    // Opens (or brings up) the window at the topic. A help file that cannot be read leaves the
    // program where it was and says in the window which file it looked for.
    void show(const std::string& helpFile, int32_t context);
    void close();

    QTextBrowser* window() const { return window_.get(); }
    bool fileRead() const { return fileRead_; }

private:
    std::unique_ptr<QTextBrowser> window_;
    bool fileRead_ = false;
};

}  // namespace zx917::ui
