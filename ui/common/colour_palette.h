#pragma once
// The two colour themes every window paints itself with.

#include <QColor>

class QWidget;

namespace kv {

struct ColourPalette {
    QColor alarm;
    QColor panel;
    QColor lightPanel;
    QColor face;
    QColor highlight;
    QColor text;
    QColor secondText;
    QColor white;
    QColor themeText;
    QColor themeAccent;
    QColor themeAccent2;
};

enum ColourThemeIndex { ThemeWhiteGreen = 0, ThemeWhiteRed = 1 };

// A theme other than 0 or 1 is taken as 0.
ColourPalette PaletteFor(int theme);

// The program-wide theme and its palette.
int ColourTheme();
void SetColourTheme(int theme);
const ColourPalette& Colours();

// The common part of every window's SetColour: face, text, panels and highlight.
void ApplyBaseColours(QWidget* window);
// A band in the theme's accent colour with white text (title bars inside windows).
void ApplyAccentColours(QWidget* band);

}  // namespace kv
