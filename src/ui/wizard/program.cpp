#include "ui/wizard/program.h"

#include <unistd.h>

#include <QPainter>
#include <QPixmap>
#include <cstdio>

#include "app/identity.h"
#include "app/startup.h"
#include "link/port_defaults.h"
#include "link/qt/port_list.h"

namespace zx917::ui {

namespace {
int scaled(int normalMs, int tickMs) {
    return std::max(1, normalMs * tickMs / 1000);
}
}  // namespace

std::string DescribeComPort(int16_t port) {
    const SystemPort d = DescribedComDevice(port);
    if (d.path.empty()) return {};
    return d.description.empty() ? d.path : d.path + " - " + d.description;
}

Program::Program(const ProgramOptions& o)
    : programFolder(o.programFolder.empty() ? ProgramFolder() : o.programFolder),
      retry(scaled(kRetryIntervalMs, o.tickMs)),
      rsRetry(scaled(kRsRetryIntervalMs, o.tickMs)),
      timer1(scaled(kTimer1IntervalMs, o.tickMs)),
      engine(EngineParts{app, script, port, retry, rsRetry, timer1, pump, file}) {
    if (!o.traceFile.empty()) {
        trace = std::make_unique<TraceWriter>(o.traceFile);
        AttachTrace(*trace, port, engine);
    }
    endProcess = [this] {
        if (trace) trace->flush();
        std::fflush(nullptr);
        ::_exit(0);  // the waits for the instrument are not unwound: nothing may run after this
    };
    WizardParts parts{.app = app,
                      .texts = texts,
                      .script = script,
                      .port = port,
                      .timer1 = timer1,
                      .engine = engine,
                      .file = file,
                      .dialogs = dialogs,
                      .programFolder = programFolder,
                      .fontFamilies = {},
                      .drawnFamily = {},
                      .describePort = DescribeComPort,
                      .endProcess = [this] { endProcess(); },
                      .showFileChooser = {}};
    window = std::make_unique<FrmMain>(parts);
    dialogs.setOwner(window.get());
}

Program::~Program() = default;

void Program::Main() {
    CreateHexFolder(programFolder);
    window->Form_Load();
    InitDefaults(app, port, programFolder);
    if (trace) trace->event("start: port 1 at " + port.settings() + ", closed");
    window->show();
}

QIcon ProgramIcon() {
    QIcon icon;
    for (int side : {16, 32, 48, 64}) {
        QPixmap pm(side, side);
        pm.fill(Qt::transparent);
        QPainter p(&pm);
        p.setRenderHint(QPainter::Antialiasing);
        const qreal u = side / 16.0;
        // An instrument face with a down arrow: firmware going in.
        p.setPen(QPen(QColor(30, 40, 60), u));
        p.setBrush(QColor(60, 110, 170));
        p.drawRoundedRect(QRectF(1 * u, 3 * u, 14 * u, 11 * u), 2 * u, 2 * u);
        p.setBrush(QColor(200, 230, 255));
        p.drawRect(QRectF(3 * u, 5 * u, 6 * u, 4 * u));
        p.setPen(Qt::NoPen);
        p.setBrush(QColor(250, 200, 40));
        const QPointF arrow[] = {{11 * u, 5 * u},   {14 * u, 5 * u},    {14 * u, 8 * u},
                                 {15.5 * u, 8 * u}, {12.5 * u, 12 * u}, {9.5 * u, 8 * u},
                                 {11 * u, 8 * u}};
        p.drawPolygon(arrow, 7);
        p.end();
        icon.addPixmap(pm);
    }
    return icon;
}

}  // namespace zx917::ui
