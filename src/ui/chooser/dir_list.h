// The chooser's folder list: the current folder's branch of the volume's folder tree (the
// folders from the volume's root down to it) and its subfolders. Its path is the current folder.
#pragma once

#include <QListWidget>
#include <functional>
#include <string>

namespace zx917::ui {

class DirList : public QListWidget {
public:
    explicit DirList(QWidget* parent = nullptr);

    const std::string& path() const { return path_; }
    // Makes a folder the current one; false (nothing changed) when it cannot be listed. The
    // change handler runs when the path changed.
    bool setPath(const std::string& folder);
    // The engineer enters a folder: one that exists becomes the current folder even when it
    // cannot be read, so that the file list (empty then) stands under it. One that is gone
    // leaves the current folder highlighted and raises the failure.
    void enter(const std::string& folder);
    // The folder of the highlighted entry.
    std::string highlighted() const;

    std::function<void()> onChange;  // dirlist_Change
    // The engineer chose a folder (double click or a key) that can no longer be listed.
    std::function<void()> onFailure;

protected:
    void keyPressEvent(QKeyEvent* event) override;

private:
    bool moveTo(const std::string& folder, bool mustRead);
    void rebuild();

    std::string path_;
    std::string volume_;
};

}  // namespace zx917::ui
