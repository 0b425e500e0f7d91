#include "ui/settings/settings_page.h"

#include <QLineEdit>

#include "ui/common/qt_text.h"
#include "ui/common/twips.h"

namespace zx917::ui {

namespace {

constexpr int kListWidth = 1215;
constexpr int kListHeight = 345;

QComboBox* makeList(QWidget* parent, const char* name, int left, int top, bool editable = false) {
    auto* list = new QComboBox(parent);
    list->setObjectName(name);
    list->setEditable(editable);
    list->setGeometry(twips(left, top, kListWidth, kListHeight));
    return list;
}

QLabel* makeLabel(QWidget* parent, const char* name, const char* text, int left, int top) {
    auto* label = new QLabel(QString::fromLatin1(text), parent);
    label->setObjectName(name);
    label->setTextFormat(Qt::PlainText);
    label->move(px(left), px(top));
    label->adjustSize();
    return label;
}

void fill(QComboBox* list, std::initializer_list<const char*> items) {
    list->clear();
    for (const char* item : items) list->addItem(QString::fromLatin1(item));
    list->setCurrentIndex(-1);
}

// The numeric value a text begins with, as the port list's "Com2" gives 2 from its 4th
// character on; 0 when it begins with no digit.
int16_t leadingNumber(const QString& text) {
    int value = 0;
    for (const QChar c : text.trimmed()) {
        if (!c.isDigit() || value > 3276) break;
        value = value * 10 + c.digitValue();
    }
    return static_cast<int16_t>(value);
}

}  // namespace

void SetListText(QComboBox* list, const QString& text) {
    const int i = list->findText(text, Qt::MatchExactly | Qt::MatchCaseSensitive);
    list->setCurrentIndex(i);
    if (i < 0 && list->isEditable()) list->setEditText(text);
}

SettingsPage::SettingsPage(QWidget* page, const SettingsParts& parts) : p_(parts) {
    Label7_1 = new QLabel(page);
    Label7_1->setObjectName("Label7_1");
    Label7_1->setTextFormat(Qt::PlainText);
    Label7_1->setText(
        "Select the Comm Port and set the settings to be same as the\nZX917's serial port "
        "settings.");
    Label7_1->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    Label7_1->setGeometry(twips(480, 240, 7455, 615));
    Label3 = new QLabel("Comm Port:", page);
    Label3->setObjectName("Label3");
    Label3->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    Label3->setGeometry(twips(480, 960, 1215, 375));
    cboPort = makeList(page, "cboPort", 1800, 960);

    Frame3 = new QGroupBox("Settings", page);
    Frame3->setObjectName("Frame3");
    Frame3->setGeometry(twips(3960, 720, 3375, 3015));
    makeLabel(Frame3, "Label1_1", "Baud Rate:", 480, 360);
    cboSpeed = makeList(Frame3, "cboSpeed", 1800, 360, true);
    cboSpeed->setInsertPolicy(QComboBox::NoInsert);  // a typed rate is used, not listed
    makeLabel(Frame3, "Label2_1", "Data Length:", 360, 720);
    cboDataBits = makeList(Frame3, "cboDataBits", 1800, 720);
    makeLabel(Frame3, "Label9_1", "Stop Bits:", 600, 1080);
    cboStopBits = makeList(Frame3, "cboStopBits", 1800, 1080);
    makeLabel(Frame3, "Label10", "Parity:", 960, 1440);
    cboParity = makeList(Frame3, "cboParity", 1800, 1440);
    makeLabel(Frame3, "Label4_0", "Xcontrol:", 720, 1800);
    cboXon = makeList(Frame3, "cboXon", 1800, 1800);
    makeLabel(Frame3, "Label4_1", "Terminator:", 480, 2160);
    cboEoc = makeList(Frame3, "cboEoc", 1800, 2160);
    cmdReset = new QPushButton("&Preset", Frame3);
    cmdReset->setObjectName("cmdReset");
    cmdReset->setGeometry(twips(1800, 2520, 1215, 375));
    QObject::connect(cmdReset, &QPushButton::clicked, [this] { cmdReset_Click(); });
    // The tooltip names the device of the port chosen.
    QObject::connect(cboPort, &QComboBox::currentIndexChanged, [this](int i) {
        cboPort->setToolTip(cboPort->itemData(i, Qt::ToolTipRole).toString());
    });
}

std::vector<QWidget*> SettingsPage::tabStops() const {
    return {cboPort, cboSpeed, cboDataBits, cboStopBits, cboParity, cboEoc, cboXon, cmdReset};
}

void SettingsPage::setListsEnabled(bool enabled) {
    for (QWidget* w : tabStops()) w->setEnabled(enabled);
}

bool SettingsPage::ProtSettings() {
    SerialPort& port = p_.port;
    cboPort->clear();
    const int16_t previous = port.commPort();
    int16_t chosen = 0;
    int selected = -1;  // the list itself selects its first item; the rule here decides
    int count = 0;
    for (int16_t n = 1; n <= kProbedPorts; ++n) {
        port.setCommPort(n);
        port.setPortOpen(true);
        if (port.portOpen() && port.commPort() == n) {
            cboPort->addItem("Com" + QString::number(n));
            const std::string where = p_.describePort ? p_.describePort(n) : std::string();
            cboPort->setItemData(count, FromFileName(where), Qt::ToolTipRole);
            if (selected < 0 || n == previous) {
                selected = count;
                chosen = n;
            }
            port.setPortOpen(false);
            ++count;
        }
    }
    cboPort->setCurrentIndex(selected);
    if (selected < 0) {
        p_.dialogs.beep();
        p_.dialogs.critical(p_.texts.MessageTable[kMsgPortUnavailable]);
        return false;
    }
    port.setCommPort(chosen);
    cboPort->setToolTip(cboPort->itemData(selected, Qt::ToolTipRole).toString());
    fill(cboSpeed, {"9600", "19200"});
    fill(cboDataBits, {"7", "8"});
    fill(cboParity, {"Even", "Odd", "None"});
    fill(cboStopBits, {"1", "2"});
    fill(cboEoc, {"LF", "CR", "CR+LF"});
    fill(cboXon, {"None", "Xon/Xoff"});
    ProtSettingsShow();
    return true;
}

// Takes the settings text apart from its right-hand end. A text too short for that leaves the
// lists it would fill without a selection rather than reading outside the text.
void SettingsPage::ProtSettingsShow() {
    const QString s = QString::fromLatin1(p_.port.settings());
    const int L = static_cast<int>(s.size());
    const int k = s.contains('.') ? 2 : 0;
    // The character at 1-based position pos, or nothing outside the text.
    auto at = [&](int pos) { return pos >= 1 && pos <= L ? QString(s[pos - 1]) : QString(); };
    if (L - 6 - k >= 1) {
        cboSpeed->setEditText(s.left(L - 6 - k));
        const QString parity = at(L - 4 - k);
        if (parity == "e") SetListText(cboParity, "Even");
        if (parity == "o") SetListText(cboParity, "Odd");
        if (parity == "n") SetListText(cboParity, "None");
        SetListText(cboDataBits, at(L - 2 - k));
        SetListText(cboStopBits, s.right(1 + k));
    }
    const std::string& t = p_.app.Terminator;
    SetListText(cboEoc, t == "\n" ? "LF" : t == "\r" ? "CR" : "CR+LF");
    const int16_t hs = p_.port.handshaking();
    cboXon->setCurrentIndex(hs >= 0 && hs < cboXon->count() ? hs : -1);
}

void SettingsPage::cmdReset_Click() {
    SetListText(cboSpeed, "9600");
    SetListText(cboDataBits, "8");
    SetListText(cboParity, "None");
    SetListText(cboStopBits, "1");
    cboXon->setCurrentIndex(0);
    SetListText(cboEoc, "CR+LF");
}

bool SettingsPage::ProtSettingsApply() {
    SerialPort& port = p_.port;
    bool failed = false;  // a failure of any step counts at the next check point
    const int16_t previous = port.commPort();
    const int16_t chosen = leadingNumber(cboPort->currentText().mid(3));
    auto fail = [&] {
        p_.dialogs.critical(p_.texts.MessageTable[kMsgPortMissing]);
        port.setCommPort(previous);
        return false;
    };
    if (chosen != previous) {
        if (port.portOpen()) failed = !port.setPortOpen(false) || failed;
        failed = !port.setCommPort(chosen) || failed;
        if (failed) return fail();
    }
    if (!port.portOpen()) {
        failed = !port.setPortOpen(true) || failed;
        if (failed) return fail();
    }
    const QString parity = cboParity->currentText().left(1).toLower();
    const QString settings = cboSpeed->currentText().trimmed() + "," + parity + "," +
                             cboDataBits->currentText().trimmed() + "," +
                             cboStopBits->currentText().trimmed();
    // Refusals from here on are not reported: the port keeps what it had.
    port.setSettings(ToLatin1(settings));
    const int eoc = cboEoc->currentIndex();
    p_.app.Terminator = eoc == 0 ? "\n" : eoc == 1 ? "\r" : "\r\n";
    port.setHandshaking(static_cast<int16_t>(cboXon->currentIndex()));
    return true;
}

}  // namespace zx917::ui
