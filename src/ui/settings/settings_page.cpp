#include "ui/settings/settings_page.h"

#include <QLineEdit>

#include "app/captions.h"
#include "link/line_settings.h"
#include "link/port_probe.h"
#include "ui/common/qt_text.h"
#include "ui/common/twips.h"

namespace zx917::ui {

namespace {

constexpr int kListWidth = 1215;
constexpr int kListHeight = 345;

QString caption(const char* control) {
    return FromLatin1(std::string(CaptionOf("FrmMain", control)));
}

QString text(std::string_view s) {
    return QString::fromLatin1(s.data(), static_cast<qsizetype>(s.size()));
}

QComboBox* makeList(QWidget* parent, const char* name, int left, int top, bool editable = false) {
    auto* list = new QComboBox(parent);
    list->setObjectName(name);
    list->setEditable(editable);
    list->setGeometry(twips(left, top, kListWidth, kListHeight));
    return list;
}

QLabel* makeLabel(QWidget* parent, const char* name, int left, int top) {
    auto* label = new QLabel(caption(name), parent);
    label->setObjectName(name);
    label->setTextFormat(Qt::PlainText);
    label->move(px(left), px(top));
    label->adjustSize();
    return label;
}

template <std::size_t N>
void fill(QComboBox* list, const std::array<ListItem, N>& items) {
    list->clear();
    for (const ListItem& item : items) list->addItem(text(item.caption), text(item.value));
    list->setCurrentIndex(-1);
}

// The item that stands for a value; none when no item does.
void selectValue(QComboBox* list, const QString& value) {
    list->setCurrentIndex(list->findData(value));
}

QString valueOf(const QComboBox* list) {
    return list->currentData().toString();
}

}  // namespace

void SetListText(QComboBox* list, const QString& text) {
    const int i = list->findText(text, Qt::MatchExactly | Qt::MatchCaseSensitive);
    list->setCurrentIndex(i);
    if (i < 0 && list->isEditable()) list->setEditText(text);
}

SettingsPage::SettingsPage(const SettingsParts& parts, QWidget* window)
    : QWidget(window), p_(parts) {
    Label7_1 = new QLabel(caption("Label7_1"), this);
    Label7_1->setObjectName("Label7_1");
    Label7_1->setTextFormat(Qt::PlainText);
    Label7_1->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    Label7_1->setGeometry(twips(480, 240, 7455, 615));
    Label3 = new QLabel(caption("Label3"), this);
    Label3->setObjectName("Label3");
    Label3->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    Label3->setGeometry(twips(480, 960, 1215, 375));
    cboPort = makeList(this, "cboPort", 1800, 960);

    Frame3 = new QGroupBox(caption("Frame3"), this);
    Frame3->setObjectName("Frame3");
    Frame3->setGeometry(twips(3960, 720, 3375, 3015));
    makeLabel(Frame3, "Label1_1", 480, 360);
    cboSpeed = makeList(Frame3, "cboSpeed", 1800, 360, true);
    cboSpeed->setInsertPolicy(QComboBox::NoInsert);  // a typed rate is used, not listed
    makeLabel(Frame3, "Label2_1", 360, 720);
    cboDataBits = makeList(Frame3, "cboDataBits", 1800, 720);
    makeLabel(Frame3, "Label9_1", 600, 1080);
    cboStopBits = makeList(Frame3, "cboStopBits", 1800, 1080);
    makeLabel(Frame3, "Label10", 960, 1440);
    cboParity = makeList(Frame3, "cboParity", 1800, 1440);
    makeLabel(Frame3, "Label4_0", 720, 1800);
    cboXon = makeList(Frame3, "cboXon", 1800, 1800);
    makeLabel(Frame3, "Label4_1", 480, 2160);
    cboEoc = makeList(Frame3, "cboEoc", 1800, 2160);
    cmdReset = new QPushButton(caption("cmdReset"), Frame3);
    cmdReset->setObjectName("cmdReset");
    cmdReset->setGeometry(twips(1800, 2520, 1215, 375));
    connect(cmdReset, &QPushButton::clicked, this, [this] { cmdReset_Click(); });
    // The tooltip names the device of the port chosen.
    connect(cboPort, &QComboBox::currentIndexChanged, this, [this](int i) {
        cboPort->setToolTip(cboPort->itemData(i, Qt::ToolTipRole).toString());
    });
}

void SettingsPage::setListsEnabled(bool enabled) {
    for (QWidget* w : std::initializer_list<QWidget*>{cboPort, cboSpeed, cboDataBits, cboStopBits,
                                                      cboParity, cboXon, cboEoc, cmdReset})
        w->setEnabled(enabled);
}

bool SettingsPage::ProtSettings() {
    cboPort->clear();
    const PortProbe probe = ProbePorts(p_.port, kProbedPorts);
    for (const int16_t n : probe.present) {
        cboPort->addItem("Com" + QString::number(n), n);
        const std::string where = p_.describePort ? p_.describePort(n) : std::string();
        cboPort->setItemData(cboPort->count() - 1, FromFileName(where), Qt::ToolTipRole);
    }
    if (!probe.selected) {
        p_.dialogs.beep();
        p_.dialogs.critical(p_.texts.MessageTable[kMsgPortUnavailable]);
        return false;
    }
    const int selected = static_cast<int>(*probe.selected);
    cboPort->setCurrentIndex(selected);
    cboPort->setToolTip(cboPort->itemData(selected, Qt::ToolTipRole).toString());
    fill(cboSpeed, kSpeedItems);
    fill(cboDataBits, kDataBitsItems);
    fill(cboParity, kParityItems);
    fill(cboStopBits, kStopBitsItems);
    fill(cboEoc, kTerminatorItems);
    fill(cboXon, kHandshakingItems);
    ProtSettingsShow();
    return true;
}

void SettingsPage::ProtSettingsShow() {
    show(p_.port.settings(), p_.app.Terminator, p_.port.handshaking());
}

// A text too short to take apart leaves the four lists it would fill without a selection.
void SettingsPage::show(const std::string& settings, const std::string& terminator,
                        int16_t handshaking) {
    if (const auto f = SettingsFieldsOf(settings)) {
        cboSpeed->setEditText(QString::fromLatin1(f->speed));
        if (const int parity = cboParity->findData(QString::fromLatin1(f->parity)); parity >= 0)
            cboParity->setCurrentIndex(parity);
        selectValue(cboDataBits, QString::fromLatin1(f->dataBits));
        selectValue(cboStopBits, QString::fromLatin1(f->stopBits));
    }
    cboEoc->setCurrentIndex(static_cast<int>(TerminatorItem(terminator)));
    selectValue(cboXon, QString::number(handshaking));
}

void SettingsPage::cmdReset_Click() {
    show(kDefaultSettings, kDefaultTerminator, 0);
}

bool SettingsPage::ProtSettingsApply() {
    SerialPort& port = p_.port;
    bool failed = false;  // a failure of any step counts at the next check point
    const int16_t previous = port.commPort();
    const auto chosen = static_cast<int16_t>(cboPort->currentData().toInt());
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
    // Refusals from here on are not reported: the port keeps what it had.
    port.setSettings(SettingsTextOf(ToLatin1(cboSpeed->currentText()), ToLatin1(valueOf(cboParity)),
                                    ToLatin1(valueOf(cboDataBits)),
                                    ToLatin1(valueOf(cboStopBits))));
    p_.app.Terminator = TerminatorOf(cboEoc->currentIndex());
    port.setHandshaking(static_cast<int16_t>(cboXon->currentIndex()));
    return true;
}

}  // namespace zx917::ui
