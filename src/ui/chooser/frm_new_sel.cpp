#include "ui/chooser/frm_new_sel.h"

#include <QDir>
#include <QKeyEvent>
#include <QSet>
#include <QShortcut>

#include "app/identity.h"
#include "firmware/download_file.h"
#include "firmware/revision.h"
#include "link/wildcard.h"
#include "ui/chooser/folder_files.h"
#include "ui/chooser/volumes.h"
#include "ui/common/centre.h"
#include "ui/common/qt_text.h"
#include "ui/common/twips.h"

namespace zx917::ui {

namespace {

constexpr int kDriveRole = Qt::UserRole;
constexpr int kNameLimitBytes = 12;

QLabel* makeLabel(QWidget* parent, const char* name, const char* text, QRect at) {
    auto* l = new QLabel(QString::fromLatin1(text), parent);
    l->setObjectName(name);
    l->setTextFormat(Qt::PlainText);
    l->setGeometry(at);
    return l;
}

QPushButton* makeButton(QWidget* parent, const char* name, const char* caption, QRect at) {
    auto* b = new QPushButton(QString::fromLatin1(caption), parent);
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
    setWindowTitle("Open");
    setWindowModality(Qt::WindowModal);
    setFixedSize(px(7080), px(4440));

    // Left: drives and folders. Middle: files, then the name and type rows. Right: the buttons
    // and the revisions.
    Label1 = makeLabel(this, "Label1", "Lookin:", twips(120, 120, 2415, 255));
    drvlist = new QComboBox(this);
    drvlist->setObjectName("drvlist");
    drvlist->setGeometry(twips(120, 390, 2415, 345));
    dirlist = new DirList(this);
    dirlist->setObjectName("dirlist");
    dirlist->setGeometry(twips(120, 840, 2415, 2415));
    File = new QListWidget(this);
    File->setObjectName("File");
    File->setGeometry(twips(2655, 390, 2655, 2415));
    Label2 = makeLabel(this, "Label2", "File Name:", twips(120, 3465, 1335, 255));
    FileName = new QLineEdit(this);
    FileName->setObjectName("FileName");
    FileName->setGeometry(twips(1455, 3420, 3855, 345));
    Label3 = makeLabel(this, "Label3", "File of type:", twips(120, 3915, 1335, 255));
    RetFile = new QComboBox(this);
    RetFile->setObjectName("RetFile");
    RetFile->setEditable(true);
    RetFile->setInsertPolicy(QComboBox::NoInsert);
    RetFile->setGeometry(twips(1455, 3870, 3855, 345));
    OpenCom = makeButton(this, "OpenCom", "&Open", twips(5550, 390, 1335, 375));
    CanselCom = makeButton(this, "CanselCom", "&Cancel", twips(5550, 870, 1335, 375));
    Frame1 = new QGroupBox("Firmware REV", this);
    Frame1->setObjectName("Frame1");
    Frame1->setGeometry(twips(5430, 2520, 1575, 1695));
    makeLabel(Frame1, "Label6", "Current:", twips(120, 300, 1335, 255));
    FirmRev1 = makeLabel(Frame1, "FirmRev1", "", twips(240, 570, 1215, 255));
    makeLabel(Frame1, "Label4", "New:", twips(120, 960, 1335, 255));
    FirmRev2 = makeLabel(Frame1, "FirmRev2", "", twips(240, 1230, 1215, 255));

    setTabOrder(drvlist, dirlist);
    setTabOrder(dirlist, File);
    setTabOrder(File, FileName);
    setTabOrder(FileName, RetFile);
    setTabOrder(RetFile, OpenCom);
    setTabOrder(OpenCom, CanselCom);

    enterClicks_.watch(OpenCom);
    enterClicks_.watch(CanselCom);
    FileName->installEventFilter(this);
    RetFile->lineEdit()->installEventFilter(this);
    connect(drvlist, &QComboBox::activated, this, [this] { drvlist_Change(); });
    dirlist->onFailure = [this] { couldNotRead(); };
    connect(File, &QListWidget::itemSelectionChanged, this, [this] { File_Click(); });
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
    dirlist->onChange = [this] { dirlist_Change(); };
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
}

void FrmNewSel::couldNotRead() {
    p_.dialogs.critical(p_.texts.MessageTable[kMsgCouldNotRead]);
}

// Sets the drive as the load step does: a different drive raises its change.
bool FrmNewSel::setDrive(const std::string& root) {
    const std::string shown = drvlist->currentData().toByteArray().toStdString();
    if (shown == root) return true;
    int i = drvlist->findData(QByteArray::fromStdString(root));
    if (i < 0) {
        drvlist->addItem(FromFileName(root), QByteArray::fromStdString(root));
        i = drvlist->count() - 1;
    }
    drvlist->setCurrentIndex(i);
    drvlist_Change();
    return true;
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
    if (p_.app.HexFolder == p_.programFolder) FillFileList();
}

// Load steps 8 to 10; false on a failure, which the load step recovers from once.
bool FrmNewSel::loadFolders() {
    const auto root = VolumeOf(p_.app.HexFolder);
    if (!root) return false;
    setDrive(*root);
    if (!dirlist->setPath(p_.app.HexFolder)) return false;
    OpenCom->setEnabled(!StripFillers(p_.app.SelectedRevision.str()).empty());
    FirmRev1->setText(FromLatin1(p_.app.CurrentRevision.str()));
    FirmRev2->setText(FromLatin1(p_.app.SelectedRevision.str()));
    return true;
}

void FrmNewSel::FillFileList() {
    File->blockSignals(true);
    File->clear();
    File->blockSignals(false);
    fillFailed_ = false;
    const auto files = PlainFiles(dirlist->path());
    if (!files) {
        fillFailed_ = true;
        return;
    }
    const std::string pattern = ToLatin1(RetFile->currentText());
    QSet<QString> listed;  // names that differ only in case open one file: listed once
    for (const FolderEntry& f : *files) {
        const QString upper = f.shown.toUpper();
        if (listed.contains(upper)) continue;
        if (WildcardMatch(upper.toStdString(), pattern) &&
            AnsiByteLengthUtf8(f.name) <= kNameLimitBytes) {
            File->addItem(upper);
            listed.insert(upper);
        }
    }
}

void FrmNewSel::drvlist_Change() {
    FileName->clear();
    FirmRev2->clear();
    const std::string root = drvlist->currentData().toByteArray().toStdString();
    if (!dirlist->setPath(root)) {
        couldNotRead();
        showDriveOf(dirlist->path());
    }
}

void FrmNewSel::dirlist_Change() {
    FillFileList();
    if (fillFailed_) {
        couldNotRead();
        showDriveOf(dirlist->path());
    }
}

void FrmNewSel::File_Click() {
    const QListWidgetItem* item = File->currentItem();
    if (item == nullptr || !item->isSelected()) return;
    FileName->setText(item->text().toUpper());
    FirmRevInfo(joinCurrent(item->text()));
}

std::string FrmNewSel::joinCurrent(const QString& shownName) const {
    return JoinPath(dirlist->path(), ResolveFileName(dirlist->path(), shownName));
}

bool FrmNewSel::FileName_KeyPress(QChar& key) {
    key = key.toUpper();
    if (key == '*' || key == ' ' || key == '/' || key == ':' || key == '\\') return false;
    if (key == QChar(13)) {
        if (FileName->text().isEmpty()) {
            FirmRev2->clear();
            p_.app.NewRevision = "       ";
            OpenCom->setEnabled(false);
        } else {
            FirmRevInfo(joinCurrent(FileName->text()));
        }
    }
    return true;
}

void FrmNewSel::RetFile_Click() {
    FillFileList();
    if (fillFailed_) couldNotRead();  // a folder gone meanwhile: say so rather than fail
}

bool FrmNewSel::RetFile_KeyPress(QChar& key) {
    key = key.toUpper();
    if (key == ' ' || key == '/' || key == ':' || key == '\\') return false;
    if (key != QChar(8)) {
        const std::string before = ToFileName(RetFile->currentText());
        if (AnsiByteLengthUtf8(StripFillers(before)) >= kNameLimitBytes) return false;
    }
    return true;
}

void FrmNewSel::RetFile_KeyDown(int key) {
    if (key != Qt::Key_Return && key != Qt::Key_Enter) return;
    FileName->clear();
    FirmRev2->clear();
    RetFile_Click();
}

void FrmNewSel::OpenCom_Click() {
    const QString name = FileName->text();
    p_.app.FilePath = joinCurrent(name);
    p_.app.SelectedFileName = ToFileName(name);
    p_.app.HexFolder = dirlist->path();
    p_.app.SelectedRevision = p_.app.NewRevision;
    accept();
}

void FrmNewSel::CanselCom_Click() {
    reject();
}

void FrmNewSel::FirmRevInfo(const std::string& path) {
    if (CheckDownloadFile({p_.app, p_.file, p_.dialogs, p_.texts}, path, 1)) {
        FirmRev2->setText(FromLatin1(StripFillers(p_.app.NewRevision.str())));
        OpenCom->setEnabled(true);
        OpenCom->setFocus();
    } else {
        OpenCom->setEnabled(false);
        FileName->clear();
        FirmRev2->clear();
    }
}

// The key filters of the name and type boxes, in the order the keys come.
bool FrmNewSel::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() != QEvent::KeyPress) return QDialog::eventFilter(watched, event);
    auto* key = static_cast<QKeyEvent*>(event);
    const bool enter = key->key() == Qt::Key_Return || key->key() == Qt::Key_Enter;
    const bool backspace = key->key() == Qt::Key_Backspace;
    QString text = key->text();
    if (enter) text = QChar(13);
    if (backspace) text = QChar(8);
    if (watched == RetFile->lineEdit() && enter) {
        RetFile_KeyDown(key->key());
        return true;
    }
    if (text.size() != 1 || (!enter && !backspace && !text[0].isPrint())) {
        return QDialog::eventFilter(watched, event);  // arrows, Tab, shortcuts
    }
    QChar c = text[0];
    QLineEdit* box = watched == FileName ? FileName : RetFile->lineEdit();
    const bool pass = watched == FileName ? FileName_KeyPress(c) : RetFile_KeyPress(c);
    if (!pass) return true;
    if (enter) return true;  // handled; no button presses it
    if (backspace) return false;
    box->insert(QString(c));
    return true;
}

}  // namespace zx917::ui
