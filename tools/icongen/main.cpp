// zx917-icongen: the program's icon for the desktop's icon theme, from the window icon's own
// drawing: DIR/hicolor/scalable/apps/ID.svg and DIR/hicolor/NxN/apps/ID.png.
#include <QDir>
#include <QFile>
#include <QGuiApplication>
#include <QImage>
#include <QPainter>
#include <QSvgRenderer>
#include <cstdio>
#include <cstdlib>

#include "app/identity.h"
#include "app/program_icon.h"

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: zx917-icongen DIR\n");
        return 2;
    }
    ::setenv("QT_QPA_PLATFORM", "offscreen", 1);
    QGuiApplication app(argc, argv);
    const QString root = QString::fromLocal8Bit(argv[1]) + "/hicolor";
    const QString id = QString::fromLatin1(zx917::kAppId);
    const QByteArray svg(zx917::kProgramIconSvg.data(),
                         static_cast<qsizetype>(zx917::kProgramIconSvg.size()));
    QDir().mkpath(root + "/scalable/apps");
    QFile scalable(root + "/scalable/apps/" + id + ".svg");
    if (!scalable.open(QIODevice::WriteOnly) || scalable.write(svg) != svg.size()) return 1;
    QSvgRenderer drawing(svg);
    for (int side : {16, 22, 24, 32, 48, 64, 128, 256}) {
        const QString dir = QString("%1/%2x%2/apps").arg(root).arg(side);
        QDir().mkpath(dir);
        QImage image(side, side, QImage::Format_ARGB32);
        image.fill(Qt::transparent);
        QPainter p(&image);
        p.setRenderHint(QPainter::Antialiasing);
        drawing.render(&p);
        p.end();
        if (!image.save(dir + "/" + id + ".png")) return 1;
    }
    return 0;
}
