#include "ui/wizard/help_viewer.h"

#include <QFile>

#include "app/identity.h"
#include "ui/common/qt_text.h"

namespace zx917::ui {

namespace {
constexpr qint64 kHelpFileLimit = 4 * 1024 * 1024;  // ours is a few kilobytes
}

QString HelpAnchor(int32_t context) {
    return "context-" + QString::number(context);
}

void HelpViewer::show(const std::string& helpFile, int32_t context) {
    if (!window_) {
        window_ = std::make_unique<QTextBrowser>();
        window_->setObjectName("HelpViewer");
        window_->setWindowTitle(QString::fromLatin1(kAppTitle) + " Help");
        window_->setOpenExternalLinks(false);
        window_->resize(560, 460);
    }
    QFile file(FromFileName(helpFile));
    QByteArray html;
    fileRead_ = file.open(QIODevice::ReadOnly) && file.size() <= kHelpFileLimit;
    if (fileRead_) html = file.readAll();
    if (!fileRead_ || html.isEmpty()) {
        fileRead_ = false;
        window_->setPlainText("The help file could not be read:\n" + FromFileName(helpFile) +
                              "\n\nIt belongs beside the program. The program goes on without it.");
    } else {
        window_->setHtml(QString::fromUtf8(html));
    }
    shownContext_ = context;
    window_->show();
    window_->raise();
    if (fileRead_) window_->scrollToAnchor(HelpAnchor(context));
}

void HelpViewer::close() {
    if (window_) window_->close();
}

}  // namespace zx917::ui
