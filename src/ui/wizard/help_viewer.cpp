#include "ui/wizard/help_viewer.h"

#include <QFileInfo>
#include <QUrl>

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
    const QFileInfo file(FromFileName(helpFile));
    fileRead_ =
        file.isFile() && file.isReadable() && file.size() > 0 && file.size() <= kHelpFileLimit;
    if (fileRead_) {
        QUrl topic = QUrl::fromLocalFile(file.absoluteFilePath());
        topic.setFragment(HelpAnchor(context));
        window_->setSource(topic, QTextDocument::HtmlResource);
    } else {
        window_->setPlainText("The help file could not be read:\n" + FromFileName(helpFile) +
                              "\n\nIt belongs beside the program. The program goes on without it.");
    }
    window_->show();
    window_->raise();
}

void HelpViewer::close() {
    if (window_) window_->close();
}

}  // namespace zx917::ui
