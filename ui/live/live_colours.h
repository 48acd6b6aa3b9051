#pragma once
// The colour theme as the live panel uses it.

#include <QColor>

namespace kv {

struct LiveColours {
    QColor alarm{255, 0, 0};
    QColor accent{0, 78, 75};  // theme accent: headings
    QColor panel{220, 220, 222};
    QColor lightPanel{230, 230, 230};
    QColor face{240, 240, 240};
    QColor highlight{37, 137, 189};
    QColor text{0, 0, 0};
    QColor background{255, 255, 255};

    // Theme 0 "White / Green", 1 "White / Red"; any other index is theme 0.
    static LiveColours ForTheme(int theme);
};

}  // namespace kv
