#include "ui/wizard/program_icon.h"

#include <QPainter>
#include <QPixmap>

namespace zx917::ui {

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
