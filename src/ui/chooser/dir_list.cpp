#include "ui/chooser/dir_list.h"

#include <QKeyEvent>
#include <filesystem>

#include "app/identity.h"
#include "ui/chooser/folder_files.h"
#include "ui/chooser/volumes.h"
#include "ui/common/qt_text.h"

namespace zx917::ui {

namespace {
constexpr int kPathRole = Qt::UserRole;
constexpr const char* kIndent = "  ";
}  // namespace

DirList::DirList(QWidget* parent) : QListWidget(parent) {
    connect(this, &QListWidget::itemDoubleClicked, this, [this](QListWidgetItem* item) {
        enter(item->data(kPathRole).toByteArray().toStdString());
    });
}

std::string DirList::highlighted() const {
    const QListWidgetItem* item = currentItem();
    return item ? item->data(kPathRole).toByteArray().toStdString() : path_;
}

bool DirList::setPath(const std::string& folder) {
    return moveTo(folder, true);
}

void DirList::enter(const std::string& folder) {
    if (moveTo(folder, false)) return;
    rebuild();  // the current folder highlighted again: the two lists agree
    if (onFailure) onFailure();
}

bool DirList::moveTo(const std::string& folder, bool mustRead) {
    std::error_code ec;
    std::string canonical = std::filesystem::weakly_canonical(folder, ec).string();
    if (ec || !(mustRead ? IsReadableFolder(canonical) : IsFolder(canonical))) return false;
    if (canonical.size() > 1 && canonical.back() == '/') canonical.pop_back();
    const auto volume = VolumeOf(canonical);
    if (!volume) return false;
    const bool changed = canonical != path_;
    path_ = canonical;
    volume_ = *volume;
    rebuild();
    if (changed && onChange) onChange();
    return true;
}

void DirList::rebuild() {
    clear();
    // The branch from the volume's root down to the current folder.
    std::vector<std::string> branch;
    for (std::filesystem::path p = path_;; p = p.parent_path()) {
        branch.insert(branch.begin(), p.string());
        if (p.string() == volume_ || p == p.parent_path()) break;
    }
    int level = 0;
    for (const std::string& folder : branch) {
        const std::string name =
            level == 0 ? folder : std::filesystem::path(folder).filename().string();
        auto* item = new QListWidgetItem(QString(kIndent).repeated(level) + FromFileName(name));
        item->setData(kPathRole, QByteArray::fromStdString(folder));
        item->setIcon(style()->standardIcon(QStyle::SP_DirOpenIcon));
        addItem(item);
        ++level;
    }
    setCurrentRow(count() - 1);
    if (const auto subfolders = Subfolders(path_)) {
        for (const FolderEntry& f : *subfolders) {
            auto* item = new QListWidgetItem(QString(kIndent).repeated(level) + f.shown);
            item->setData(kPathRole, QByteArray::fromStdString(JoinPath(path_, f.name)));
            item->setIcon(style()->standardIcon(QStyle::SP_DirClosedIcon));
            addItem(item);
        }
    }
}

// Any character key, Enter included, makes the highlighted entry the current folder; the key
// then goes on as usual.
void DirList::keyPressEvent(QKeyEvent* event) {
    const bool character = !event->text().isEmpty() && event->text() != "\t";
    if (character) {
        const std::string target = highlighted();
        if (target != path_) enter(target);
    }
    QListWidget::keyPressEvent(event);
}

}  // namespace zx917::ui
