#include "ui/common/colour_palette.h"

#include <QPalette>
#include <QWidget>

namespace kv {

namespace {

struct PaletteRow {
    QColor ColourPalette::*entry;
    QRgb whiteGreen;
    QRgb whiteRed;
};

// clang-format off
const PaletteRow paletteRows[] = {
    {&ColourPalette::alarm,        qRgb(255, 0, 0),     qRgb(255, 0, 0)},
    {&ColourPalette::panel,        qRgb(220, 220, 222), qRgb(220, 220, 222)},
    {&ColourPalette::lightPanel,   qRgb(230, 230, 230), qRgb(230, 230, 230)},
    {&ColourPalette::face,         qRgb(240, 240, 240), qRgb(240, 240, 240)},
    {&ColourPalette::highlight,    qRgb(37, 137, 189),  qRgb(37, 137, 189)},
    {&ColourPalette::text,         qRgb(0, 0, 0),       qRgb(0, 0, 0)},
    {&ColourPalette::secondText,   qRgb(0, 0, 0),       qRgb(0, 0, 0)},
    {&ColourPalette::white,        qRgb(255, 255, 255), qRgb(255, 255, 255)},
    {&ColourPalette::themeText,    qRgb(0, 0, 0),       qRgb(0, 0, 0)},
    {&ColourPalette::themeAccent,  qRgb(0, 78, 75),     qRgb(150, 0, 0)},
    {&ColourPalette::themeAccent2, qRgb(0, 78, 75),     qRgb(150, 0, 0)},
};
// clang-format on

int theme = ThemeWhiteRed;
ColourPalette current = PaletteFor(ThemeWhiteRed);

}  // namespace

ColourPalette PaletteFor(int index) {
    const bool red = index == ThemeWhiteRed;
    ColourPalette palette;
    for (const PaletteRow& row : paletteRows)
        palette.*row.entry = QColor(red ? row.whiteRed : row.whiteGreen);
    return palette;
}

int ColourTheme() {
    return theme;
}

void SetColourTheme(int index) {
    theme = index == ThemeWhiteRed ? ThemeWhiteRed : ThemeWhiteGreen;
    current = PaletteFor(theme);
}

const ColourPalette& Colours() {
    return current;
}

void ApplyBaseColours(QWidget* window) {
    const ColourPalette& c = Colours();
    QPalette p = window->palette();
    p.setColor(QPalette::Window, c.face);
    p.setColor(QPalette::WindowText, c.text);
    p.setColor(QPalette::Base, c.white);
    p.setColor(QPalette::AlternateBase, c.lightPanel);
    p.setColor(QPalette::Text, c.text);
    p.setColor(QPalette::Button, c.panel);
    p.setColor(QPalette::ButtonText, c.text);
    p.setColor(QPalette::Highlight, c.highlight);
    p.setColor(QPalette::HighlightedText, c.white);
    window->setPalette(p);
}

void ApplyAccentColours(QWidget* band) {
    const ColourPalette& c = Colours();
    QPalette p = band->palette();
    p.setColor(QPalette::Window, c.themeAccent);
    p.setColor(QPalette::WindowText, c.white);
    p.setColor(QPalette::Button, c.themeAccent2);
    p.setColor(QPalette::ButtonText, c.white);
    band->setPalette(p);
    band->setAutoFillBackground(true);
}

}  // namespace kv
