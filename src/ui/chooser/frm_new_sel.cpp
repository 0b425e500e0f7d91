#include "ui/chooser/frm_new_sel.h"

#include <QDir>
#include <QMouseEvent>
#include <QShortcut>
#include <utility>

#include "app/captions.h"
#include "app/identity.h"
#include "firmware/download_file.h"
#include "firmware/file_choice.h"
#include "firmware/revision.h"
#include "ui/chooser/box_validators.h"
#include "ui/chooser/folder_files.h"
#include "ui/chooser/volumes.h"
#include "ui/common/centre.h"
#include "ui/common/qt_text.h"
#include "ui/common/twips.h"

namespace zx917::ui {

namespace {

constexpr int kNameRole = Qt::UserRole;  // a file list entry's real name

QString caption(const char* control) {
    return FromLatin1(std::string(CaptionOf("FrmNewSel", control)));
}

QLabel* makeLabel(QWidget* parent, const char* name, QRect at) {
    auto* l = new QLabel(caption(name), parent);
    l->setObjectName(name);
    l->setTextFormat(Qt::PlainText);
    l->setGeometry(at);
    return l;
}

QPushButton* makeButton(QWidget* parent, const char* name, QRect at) {
    auto* b = new QPushButton(caption(name), parent);
    b->setObjectName(name);
    b->setGeometry(at);
    // Enter in the name box checks the file; it must never press a button for it.
    b->setAutoDefault(false);
    b->setDefault(false);
    return b;
}

}  // namespace

FrmNewSel::FrmNewSel(const ChooserParts& parts, QWidget* owner)
    : QDialog(owner, Qt::Dialog | Qt::CustomizeWindowHint | Qt::WindowTitleHint |
                         Qt::WindowCloseButtonHint | Qt::MSWindowsFixedSizeDialogHint),
      p_(parts) {
    setObjectName("FrmNewSel");
    setWindowTitle(caption("FrmNewSel"));
    setWindowModality(Qt::WindowModal);
    setFixedSize(px(7080), px(4440));

    // Left: drives and folders. Middle: files, then the name and type rows. Right: the buttons
    // and the revisions.
    Label1 = makeLabel(this, "Label1", twips(120, 120, 2415, 255));
    drvlist = new QComboBox(this);
    drvlist->setObjectName("drvlist");
    drvlist->setGeometry(twips(120, 390, 2415, 345));
    dirlist = new DirList(this);
    dirlist->setObjectName("dirlist");
    dirlist->setGeometry(twips(120, 840, 2415, 2415));
    File = new QListWidget(this);
    File->setObjectName("File");
    File->setGeometry(twips(2655, 390, 2655, 2415));
    Label2 = makeLabel(this, "Label2", twips(120, 3465, 1335, 255));
    FileName = new QLineEdit(this);
    FileName->setObjectName("FileName");
    FileName->setGeometry(twips(1455, 3420, 3855, 345));
    Label3 = makeLabel(this, "Label3", twips(120, 3915, 1335, 255));
    RetFile = new QComboBox(this);
    RetFile->setObjectName("RetFile");
    RetFile->setEditable(true);
    RetFile->setInsertPolicy(QComboBox::NoInsert);
    RetFile->setGeometry(twips(1455, 3870, 3855, 345));
    OpenCom = makeButton(this, "OpenCom", twips(5550, 390, 1335, 375));
    CanselCom = makeButton(this, "CanselCom", twips(5550, 870, 1335, 375));
    Frame1 = new QGroupBox(caption("Frame1"), this);
    Frame1->setObjectName("Frame1");
    Frame1->setGeometry(twips(5430, 2520, 1575, 1695));
    makeLabel(Frame1, "Label6", twips(120, 300, 1335, 255));
    FirmRev1 = makeLabel(Frame1, "FirmRev1", twips(240, 570, 1215, 255));
    makeLabel(Frame1, "Label4", twips(120, 960, 1335, 255));
    FirmRev2 = makeLabel(Frame1, "FirmRev2", twips(240, 1230, 1215, 255));

    setTabOrder(drvlist, dirlist);
    setTabOrder(dirlist, File);
    setTabOrder(File, FileName);
    setTabOrder(FileName, RetFile);
    setTabOrder(RetFile, OpenCom);
    setTabOrder(OpenCom, CanselCom);

    enterClicks_.watchAll(this);
    if (!p_.listFiles) p_.listFiles = PlainFiles;
    // Keys, paste, drop and input methods all reach the boxes through their rules; a real key
    // for the type box arrives at the list, which hands it to its text box past any filter.
    FileName->setValidator(new BoxValidator(FileNameText, FileName));
    RetFile->setValidator(new BoxValidator(RetFileText, RetFile));
    RetFile->setCompleter(nullptr);
    connect(FileName, &QLineEdit::returnPressed, this, [this] { FileName_KeyPress(); });
    connect(FileName, &QLineEdit::textChanged, this, [this] { updateOpen(); });
    connect(RetFile->lineEdit(), &QLineEdit::returnPressed, this,
            [this] { RetFile_KeyDown(Qt::Key_Return); });
    connect(drvlist, &QComboBox::activated, this, [this] {
        // The list raises this for the drive already shown too; only a new drive changes.
        if (drvlist->currentData().toByteArray().toStdString() != shownDrive_) drvlist_Change();
    });
    dirlist->onFailure = [this] { couldNotRead(); };
    connect(File, &QListWidget::itemSelectionChanged, this, [this] { File_Click(); });
    // A click on the entry already selected checks it again (after a refusal, say).
    File->viewport()->installEventFilter(this);
    connect(File, &QListWidget::itemClicked, this, [this] {
        if (std::exchange(pressedOnSelected_, false)) File_Click();
    });
    connect(RetFile, &QComboBox::activated, this, [this] { RetFile_Click(); });
    connect(OpenCom, &QPushButton::clicked, this, [this] { OpenCom_Click(); });
    connect(CanselCom, &QPushButton::clicked, this, [this] { CanselCom_Click(); });
    auto* f1 = new QShortcut(QKeySequence(Qt::Key_F1), this);
    connect(f1, &QShortcut::activated, this, [this] {
        if (p_.showHelp) p_.showHelp(property("helpContext").toInt());
    });

    for (const Volume& v : MountedVolumes()) {
        drvlist->addItem(v.shown, QByteArray::fromStdString(v.root));
    }
    // The folder list starts at the process's current folder; that is no change of folder.
    dirlist->setPath(ToFileName(QDir::currentPath()));
    showDriveOf(dirlist->path());
    dirlist->onChange = [this] {
        folderChanged_ = true;
        dirlist_Change();
    };
}

void FrmNewSel::showDriveOf(const std::string& folder) {
    const auto root = VolumeOf(folder);
    if (!root) return;
    int i = drvlist->findData(QByteArray::fromStdString(*root));
    if (i < 0) {  // a volume the list left out still shows as the folder's drive
        drvlist->addItem(FromFileName(*root), QByteArray::fromStdString(*root));
        i = drvlist->count() - 1;
    }
    drvlist->setCurrentIndex(i);
    shownDrive_ = *root;
}

void FrmNewSel::couldNotRead() {
    p_.dialogs.critical(p_.texts.MessageTable[kMsgCouldNotRead]);
}

// Sets the drive as the load step does: a different drive raises its change.
void FrmNewSel::setDrive(const std::string& root) {
    if (root == shownDrive_) return;
    int i = drvlist->findData(QByteArray::fromStdString(root));
    if (i < 0) {
        drvlist->addItem(FromFileName(root), QByteArray::fromStdString(root));
        i = drvlist->count() - 1;
    }
    drvlist->setCurrentIndex(i);
    drvlist_Change();
}

void FrmNewSel::Form_Load() {
    CentreOnScreen(*this);
    setProperty("helpContext", kChooserHelpContext);
    // The file list reaches down to the folder list's bottom.
    File->setGeometry(File->x(), drvlist->y(), File->width(),
                      dirlist->y() + dirlist->height() - drvlist->y());
    RetFile->clear();
    RetFile->setEditText("*.HEX");
    RetFile->addItem("*.HEX");
    RetFile->addItem("*.*");
    RetFile->setCurrentIndex(0);
    FileName->setText(FromFileName(p_.app.SelectedFileName));
    File->clear();
    bool recovered = false;
    for (;;) {
        folderChanged_ = false;
        if (loadFolders()) break;
        if (recovered) {  // a second failure ends the load silently
            return;
        }
        couldNotRead();
        FirmRev2->clear();
        FileName->clear();
        p_.app.SelectedFileName.clear();
        p_.app.HexFolder = p_.programFolder;
        p_.app.SelectedRevision = "       ";
        recovered = true;
    }
    // The folder list may already have stood in the start folder (the process's working
    // folder): then no change of folder filled the list.
    if (!folderChanged_) FillFileList();
}

// Load steps 8 to 10; false on a failure, which the load step recovers from once.
bool FrmNewSel::loadFolders() {
    const auto root = VolumeOf(p_.app.HexFolder);
    if (!root) return false;
    setDrive(*root);
    if (!dirlist->setPath(p_.app.HexFolder)) return false;
    accepted_.reset();
    if (!StripFillers(p_.app.SelectedRevision.str()).empty()) {
        accepted_ = Accepted{dirlist->path(), FromFileName(p_.app.SelectedFileName),
                             p_.app.FilePath, p_.app.SelectedRevision};
    }
    updateOpen();
    FirmRev1->setText(FromLatin1(p_.app.CurrentRevision.str()));
    FirmRev2->setText(FromLatin1(p_.app.SelectedRevision.str()));
    return true;
}

void FrmNewSel::FillFileList() {
    File->blockSignals(true);
    File->clear();
    File->blockSignals(false);
    const auto names = p_.listFiles(dirlist->path());
    fillFailed_ = !names;
    if (!names) return;
    for (const ListedName& n : ListedFileNames(*names, RetFile->currentText().toStdString())) {
        auto* entry = new QListWidgetItem(QString::fromStdString(n.shown), File);
        entry->setData(kNameRole, QByteArray::fromStdString(n.name));
    }
}

void FrmNewSel::drvlist_Change() {
    FileName->clear();
    FirmRev2->clear();
    const std::string root = drvlist->currentData().toByteArray().toStdString();
    shownDrive_ = root;
    if (!dirlist->setPath(root)) {
        couldNotRead();
        showDriveOf(dirlist->path());
    }
}

void FrmNewSel::dirlist_Change() {
    updateOpen();
    FillFileList();
    if (fillFailed_) {
        couldNotRead();
        showDriveOf(dirlist->path());
    }
}

void FrmNewSel::File_Click() {
    const QListWidgetItem* item = File->currentItem();
    if (item == nullptr || !item->isSelected()) return;
    FileName->setText(item->text());
    FirmRevInfo(JoinPath(dirlist->path(), RealName(*item)));
}

std::string FrmNewSel::RealName(const QListWidgetItem& entry) {
    return entry.data(kNameRole).toByteArray().toStdString();
}

std::string FrmNewSel::joinCurrent(const QString& shownName) const {
    return JoinPath(dirlist->path(), ResolveFileName(dirlist->path(), shownName));
}

void FrmNewSel::FileName_KeyPress() {
    if (FileName->text().isEmpty()) {
        FirmRev2->clear();
        p_.app.NewRevision = "       ";
        accepted_.reset();
        updateOpen();
    } else {
        FirmRevInfo(joinCurrent(FileName->text()));
    }
}

void FrmNewSel::RetFile_Click() {
    FillFileList();
    if (fillFailed_) couldNotRead();  // a folder gone meanwhile: say so rather than fail
}

void FrmNewSel::RetFile_KeyDown(int key) {
    if (key != Qt::Key_Return && key != Qt::Key_Enter) return;
    FileName->clear();
    FirmRev2->clear();
    RetFile_Click();
}

void FrmNewSel::OpenCom_Click() {
    if (!OpenCom->isEnabled() || !accepted_) return;
    p_.app.FilePath = accepted_->path;
    p_.app.SelectedFileName = ToFileName(accepted_->name);
    p_.app.HexFolder = accepted_->folder;
    p_.app.SelectedRevision = accepted_->revision;
    accept();
}

void FrmNewSel::CanselCom_Click() {
    reject();
}

void FrmNewSel::FirmRevInfo(const std::string& path) {
    if (CheckDownloadFile({p_.app, p_.file, p_.dialogs, p_.texts}, path, 1)) {
        accepted_ = Accepted{dirlist->path(), FileName->text(), path, p_.app.NewRevision};
        FirmRev2->setText(FromLatin1(StripFillers(p_.app.NewRevision.str())));
        updateOpen();
        OpenCom->setFocus();
    } else {
        accepted_.reset();
        FileName->clear();
        FirmRev2->clear();
        updateOpen();
    }
}

void FrmNewSel::updateOpen() {
    OpenCom->setEnabled(accepted_ && accepted_->folder == dirlist->path() &&
                        accepted_->name == FileName->text());
}

// Notes whether a press on the file list lands on the entry already selected.
bool FrmNewSel::eventFilter(QObject* watched, QEvent* event) {
    if (watched == File->viewport() && event->type() == QEvent::MouseButtonPress) {
        const auto* press = static_cast<QMouseEvent*>(event);
        const QListWidgetItem* at = File->itemAt(press->position().toPoint());
        pressedOnSelected_ = at != nullptr && at->isSelected();
    }
    return QDialog::eventFilter(watched, event);
}

}  // namespace zx917::ui
