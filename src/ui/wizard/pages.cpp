// The pages as designed: every control with its name, caption and place in twips, built from
// the page table; the page procedures, the tab order and the revision font.
#include <QFontDatabase>
#include <QFontInfo>
#include <QPainter>

#include "ui/common/qt_text.h"
#include "ui/common/twips.h"
#include "ui/wizard/frm_main.h"

namespace zx917::ui {

namespace {

// The etched separator above the button row: a shadow line and a light line under it.
class Separator : public QWidget {
public:
    explicit Separator(QWidget* parent) : QWidget(parent) {
        setGeometry(px(120), px(3840), px(8280) - px(120) + 1, 3);
        setAttribute(Qt::WA_TransparentForMouseEvents);
    }

protected:
    void paintEvent(QPaintEvent*) override {
        QPainter p(this);
        p.setPen(QPen(palette().color(QPalette::Dark), 1));
        p.drawLine(0, 0, width() - 1, 0);
        p.setPen(QPen(palette().color(QPalette::Base), 2));
        p.drawLine(0, 2, width() - 1, 2);
    }
};

QString name(const char* base, int index) {
    return QString::fromLatin1(base) + "_" + QString::number(index);
}

QString caption(std::string_view control) {
    return FromLatin1(std::string(CaptionOf("FrmMain", control)));
}

// A label with its caption from the caption table under captionKey (its own name when empty).
template <typename Label = QLabel>
Label* label(QWidget* parent, const QString& objectName, int left, int top, int width = 0,
             int height = 0, Qt::Alignment align = Qt::AlignLeft,
             std::string_view captionKey = {}) {
    const std::string own = objectName.toStdString();
    auto* l = new Label(caption(captionKey.empty() ? std::string_view(own) : captionKey), parent);
    l->setObjectName(objectName);
    l->setTextFormat(Qt::PlainText);
    l->setAlignment(align | Qt::AlignTop);
    if (width > 0) {
        l->setGeometry(twips(left, top, width, height));
        l->setWordWrap(true);
    } else {
        l->setProperty("autoSize", true);
        l->move(px(left), px(top));
        l->adjustSize();
    }
    return l;
}

QPushButton* button(QWidget* parent, const QString& objectName, const QString& text, int left,
                    int top, int width, int height) {
    auto* b = new QPushButton(text, parent);
    b->setObjectName(objectName);
    b->setGeometry(twips(left, top, width, height));
    b->setAutoDefault(false);
    return b;
}

constexpr int kButtonTop = 3960;
constexpr int kButtonWidth = 1215;
constexpr int kButtonHeight = 375;

}  // namespace

void SetCaption(QLabel* label, const QString& text) {
    if (auto* name = dynamic_cast<NameLabel*>(label)) return name->setName(text);
    label->setText(text);
    if (label->property("autoSize").toBool()) label->adjustSize();
}

void FrmMain::buildPages() {
    for (int n = 0; n < kPages; ++n) {
        QWidget* page = nullptr;
        if (n == 1) {
            settings = new SettingsPage(SettingsParts{.app = p_.app,
                                                      .texts = p_.texts,
                                                      .port = p_.port,
                                                      .dialogs = p_.dialogs,
                                                      .describePort = p_.describePort},
                                        this);
            page = settings;
        } else {
            page = new QWidget(this);
        }
        page->setObjectName(name("Picture4", n));
        page->setGeometry(twips(0, 0, 8295, kPageRows[n].height));
        Picture4[n] = page;
        new Separator(page);
        buildButtonRow(n);
        if (kPageRows[n].summary) buildSummary(n, *kPageRows[n].summary);
    }
    // Page 0: the instructions.
    label(Picture4[0], "Label12_2", 360, 960, 7695, 2415);

    // Page 2: the instrument's revision and the choice of the file.
    QWidget* p2 = Picture4[2];
    Frame1 = new QGroupBox(caption("Frame1"), p2);
    Frame1->setObjectName("Frame1");
    Frame1->setGeometry(twips(240, 600, 7935, 1215));
    CurFirmInfo[2] = label(Frame1, "CurFirmInfo_2", 3240, 480, 1932, 612, Qt::AlignHCenter);
    Frame2 = new QGroupBox(caption("Frame2"), p2);
    Frame2->setObjectName("Frame2");
    Frame2->setGeometry(twips(240, 2160, 7935, 1455));
    CmdFirmSelect = button(Frame2, "CmdFirmSelect", caption("CmdFirmSelect"), 240, 480, 2895, 735);
    connect(CmdFirmSelect, &QPushButton::clicked, this, [this] { CmdFirmSelect_Click(); });
    NewFirmInfo[2] = label(Frame2, "NewFirmInfo_2", 3240, 600, 1812, 612, Qt::AlignHCenter);
    label(Frame2, "Label5_9", 5160, 720, 0, 0, Qt::AlignLeft, "OpenBracket");
    NewFirmFile[2] =
        label<NameLabel>(Frame2, "NewFirmFile_2", 5280, 720, 1572, 252, Qt::AlignHCenter);
    NewFirmFile[2]->setWordWrap(false);
    label(Frame2, "Label5_8", 6960, 720, 0, 0, Qt::AlignLeft, "CloseBracket");
    QFont large("Times New Roman");
    large.setPointSizeF(20.4);
    large.setBold(false);
    CurFirmInfo[2]->setFont(large);
    NewFirmInfo[2]->setFont(large);

    // Page 3: the estimate.
    label(Picture4[3], "Label6", 600, 2040, 7215, 375, Qt::AlignHCenter);
    label(Picture4[3], "Label7_0", 2400, 3360);
    RemTime[2] = label(Picture4[3], "RemTime_2", 4080, 3360);

    // Page 4: the transfer.
    QWidget* p4 = Picture4[4];
    label(p4, "Label5_2", 2280, 1560, 3855, 495);
    Animation1 = new ClipPlayer(p4);
    Animation1->setObjectName("Animation1");
    Animation1->setGeometry(twips(2280, 2040, 3255, 855));
    label(p4, "Label11_1", 240, 3000);
    ProgressBar = new QProgressBar(p4);
    ProgressBar->setObjectName("ProgressBar");
    ProgressBar->setGeometry(twips(1200, 3000, 6735, 255));
    ProgressBar->setTextVisible(false);
    label(p4, "Label8_0", 1080, 3360);
    RedByte4 = label(p4, "RedByte_4", 3000, 3360);
    label(p4, "Label7_2", 4560, 3360);
    RemTime[4] = label(p4, "RemTime_4", 6240, 3360);

    // Page 5: completion.
    label(Picture4[5], "Label12_0", 600, 2040, 7215, 375, Qt::AlignHCenter);

    for (int n = 0; n < kPages; ++n) {
        for (const std::string_view stop : kPageRows[n].tabStops) {
            if (stop.empty()) break;
            auto* w = Picture4[n]->findChild<QWidget*>(QString::fromLatin1(stop));
            Q_ASSERT(w != nullptr);
            tabStops_[n].push_back(w);
        }
    }
}

void FrmMain::buildButtonRow(int n) {
    const PageRow& row = kPageRows[n];
    QWidget* page = Picture4[n];
    auto connectSet = [this](QPushButton* b, void (FrmMain::*handler)(int16_t), int index) {
        connect(b, &QPushButton::clicked, this,
                [this, handler, index] { (this->*handler)(static_cast<int16_t>(index)); });
    };
    if (!row.back.empty()) {
        CmdBack[n] = button(page, name("CmdBack", n), FromLatin1(std::string(row.back)), 2760,
                            kButtonTop, kButtonWidth, kButtonHeight);
        connectSet(CmdBack[n], &FrmMain::CmdBack_Click, n);
    }
    if (!row.next.empty()) {
        CmdNext[n] = button(page, name("CmdNext", n), FromLatin1(std::string(row.next)), 3960,
                            kButtonTop, kButtonWidth, kButtonHeight);
        connectSet(CmdNext[n], &FrmMain::CmdNext_Click, n);
    }
    if (row.cancel) {
        CmdExit[n] = button(page, name("CmdExit", n), caption("CmdExit"), 5760, kButtonTop,
                            kButtonWidth, kButtonHeight);
        connectSet(CmdExit[n], &FrmMain::CmdExit_Click, n);
    }
    CmdHelp[n] = button(page, name("CmdHelp", n), caption("CmdHelp"), 7080, kButtonTop,
                        kButtonWidth, kButtonHeight);
    connectSet(CmdHelp[n], &FrmMain::CmdHelp_Click, n);
}

void FrmMain::buildSummary(int n, const SummaryRow& s) {
    QWidget* page = Picture4[n];
    label(page, name("Label1", s.captionIndex), 360, 495, 0, 0, Qt::AlignLeft, "Label1");
    CurFirmInfo[n] = label(page, name("CurFirmInfo", n), 2640, s.curTop);
    label(page, name("Label2", s.captionIndex), 360, s.newCaptionTop, 0, 0, Qt::AlignLeft,
          "Label2");
    NewFirmInfo[n] = label(page, name("NewFirmInfo", n), 2640, s.newTop);
    label(page, name("Label5", s.openIndex), 3720, 1100, 0, 0, Qt::AlignLeft, "OpenBracket");
    NewFirmFile[n] = label<NameLabel>(page, name("NewFirmFile", n), 3840, 1080, s.fileWidth, 255,
                                      Qt::AlignHCenter);
    NewFirmFile[n]->setWordWrap(false);
    label(page, name("Label5", s.closeIndex), s.closeBracketLeft, 1080, 0, 0, Qt::AlignLeft,
          "CloseBracket");
}

void FrmMain::SetPage(int n, bool show) {
    Picture4[n]->setEnabled(show);
    Picture4[n]->setVisible(show);
    if (show && kPageRows[n].summary) {
        // The summary shows page 2 as it is at this moment.
        if (n == 4) SetCaption(RemTime[4], RemTime[2]->text());
        SetCaption(CurFirmInfo[n], CurFirmInfo[2]->text());
        SetCaption(NewFirmInfo[n], NewFirmInfo[2]->text());
        NewFirmFile[n]->setName(NewFirmFile[2]->name());
    }
    for (QWidget* w : tabStops_[n]) w->setFocusPolicy(show ? Qt::StrongFocus : Qt::NoFocus);
    if (show && n == 0 && p_.port.portOpen()) p_.port.setPortOpen(false);
}

void FrmMain::GoToPage(int page) {
    showProgressNow();
    SetPage0(page == 0);
    SetPage1(page == 1);
    SetPage2(page == 2);
    SetPage3(page == 3);
    SetPage4(page == 4);
    SetPage5(page == 5);
}

int FrmMain::currentPage() const {
    for (int n = 0; n < kPages; ++n) {
        if (Picture4[n]->isVisibleTo(this)) return n;
    }
    return -1;
}

void FrmMain::SetTabOrder() {
    // One order across the pages, tab index 0 first; hidden pages drop out of it by themselves.
    QWidget* previous = nullptr;
    for (const auto& page : tabStops_) {
        for (QWidget* w : page) {
            if (previous != nullptr) QWidget::setTabOrder(previous, w);
            previous = w;
        }
    }
}

namespace {
// Arial's metric-compatible stand-ins, which a system without Arial serves for "Arial".
bool isArialSubstitute(const QString& family) {
    return family == "Liberation Sans" || family == "Arimo";
}
}  // namespace

void FrmMain::REV_Font() {
    QString family = "System";
    qreal size = 10;
    const QStringList families = p_.fontFamilies ? p_.fontFamilies() : QFontDatabase::families();
    for (const QString& f : families) {
        if (f.startsWith("Arial", Qt::CaseSensitive)) {
            family = f;
            size = 20;
            break;
        }
    }
    if (size != 20) {
        // No family is named Arial, but the system may draw "Arial" with its stand-in.
        const QString drawn =
            p_.drawnFamily ? p_.drawnFamily("Arial") : QFontInfo(QFont("Arial")).family();
        if (isArialSubstitute(drawn)) {
            family = drawn;
            size = 20;
        }
    }
    for (QLabel* l : {CurFirmInfo[2], NewFirmInfo[2]}) {
        QFont font = l->font();
        font.setFamily(family);
        font.setPointSizeF(size);
        l->setFont(font);
    }
}

}  // namespace zx917::ui
