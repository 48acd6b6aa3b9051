#include "ui/hub/settings_window_classes.h"

namespace kv {

std::vector<SettingsWindowClass> SettingsWindowClasses() {
    // The model editors add their rows here: {map, "frmKV720", factory}.
    return {};
}

SettingsWindowRegistry::SettingsWindowRegistry() {
    for (const SettingsWindowClass& windowClass : SettingsWindowClasses())
        add(windowClass);
}

void SettingsWindowRegistry::add(const SettingsWindowClass& windowClass) {
    classes_[windowClass.map] = windowClass;
}

const SettingsWindowClass* SettingsWindowRegistry::find(int map) const {
    const auto it = classes_.find(map);
    return it == classes_.end() ? nullptr : &it->second;
}

}  // namespace kv
