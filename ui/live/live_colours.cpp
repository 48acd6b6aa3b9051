#include "ui/live/live_colours.h"

namespace kv {

LiveColours LiveColours::ForTheme(int theme) {
    LiveColours colours;
    if (theme == 1)
        colours.accent = QColor(150, 0, 0);
    return colours;
}

}  // namespace kv
