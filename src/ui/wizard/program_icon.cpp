#include "ui/wizard/program_icon.h"

#include <QPainter>
#include <QPixmap>
#include <QSvgRenderer>

#include "app/program_icon.h"

namespace zx917::ui {

QImage ProgramIconImage(int side) {
    QSvgRenderer drawing(QByteArray::fromRawData(kProgramIconSvg.data(),
                                                 static_cast<qsizetype>(kProgramIconSvg.size())));
    QImage image(side, side, QImage::Format_ARGB32_Premultiplied);
    image.fill(Qt::transparent);
    QPainter p(&image);
    p.setRenderHint(QPainter::Antialiasing);
    drawing.render(&p);
    return image;
}

QIcon ProgramIcon() {
    QIcon icon;
    for (int side : {16, 32, 48, 64}) icon.addPixmap(QPixmap::fromImage(ProgramIconImage(side)));
    return icon;
}

}  // namespace zx917::ui
