#include "model/settings_set.h"

namespace kv {

void SettingsSet::SetFileName(const QString& name) {
    FileName = name.left(FileNameLength).leftJustified(FileNameLength, QLatin1Char(' '));
}

SettingsSet& RestoredSet() {
    static SettingsSet restored;
    return restored;
}

}  // namespace kv
