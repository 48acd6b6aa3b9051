#pragma once
// A small labelled indicator: a rounded tag that lights in a colour, or stays
// as a faint outline while off so the layout does not move.

#include <QColor>
#include <QWidget>

namespace kv {

class IndicatorLamp : public QWidget {
public:
    explicit IndicatorLamp(const QString& offText, QWidget* parent = nullptr);

    void setLit(const QColor& colour, const QString& text);
    void setOff();
    void setOutline(const QColor& colour) {
        outline_ = colour;
        update();
    }
    bool isLit() const { return lit_; }
    QString text() const { return lit_ ? litText_ : offText_; }

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override { return sizeHint(); }

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QString offText_;
    QString litText_;
    QColor colour_;
    QColor outline_{200, 200, 200};
    bool lit_ = false;
};

}  // namespace kv
