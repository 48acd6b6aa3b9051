#include "ui/live/indicator_lamp.h"

#include <QPainter>

namespace kv {

namespace {
// Width for the longest text any lamp shows, so lamps line up.
const QString widestText = QStringLiteral("HIGH");
}  // namespace

IndicatorLamp::IndicatorLamp(const QString& offText, QWidget* parent)
    : QWidget(parent), offText_(offText) {
    QFont small = font();
    small.setBold(true);
    small.setPointSizeF(small.pointSizeF() * 0.8);
    setFont(small);
    setAccessibleName(offText);
}

void IndicatorLamp::setLit(const QColor& colour, const QString& text) {
    // The panel re-applies every lamp on each stored register; repaint only real changes.
    if (lit_ && colour_ == colour && litText_ == text)
        return;
    lit_ = true;
    colour_ = colour;
    litText_ = text;
    setAccessibleDescription(text);
    update();
}

void IndicatorLamp::setOff() {
    if (!lit_)
        return;
    lit_ = false;
    setAccessibleDescription(QString());
    update();
}

QSize IndicatorLamp::sizeHint() const {
    const QFontMetrics metrics(font());
    return {metrics.horizontalAdvance(widestText) + metrics.height(), metrics.height() + 4};
}

void IndicatorLamp::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    const QRectF box = QRectF(rect()).adjusted(0.5, 0.5, -0.5, -0.5);
    const qreal radius = box.height() / 2;
    if (lit_) {
        painter.setPen(Qt::NoPen);
        painter.setBrush(colour_);
        painter.drawRoundedRect(box, radius, radius);
        painter.setPen(colour_.lightness() > 150 ? Qt::black : Qt::white);
    } else {
        painter.setPen(outline_);
        painter.setBrush(Qt::NoBrush);
        painter.drawRoundedRect(box, radius, radius);
    }
    painter.drawText(box, Qt::AlignCenter, text());
}

}  // namespace kv
