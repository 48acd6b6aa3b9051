#pragma once
// Which settings window opens for a register map (1..7).

#include <QString>

#include <functional>
#include <map>
#include <vector>

namespace kv {

class hub;
class SettingsWindow;

using SettingsWindowFactory = std::function<SettingsWindow*(hub& owner)>;

struct SettingsWindowClass {
    int map;
    QString className;  // for messages, e.g. "frmKV720"
    SettingsWindowFactory create;
};

// One row per register map whose editor exists.
std::vector<SettingsWindowClass> SettingsWindowClasses();

class SettingsWindowRegistry {
public:
    SettingsWindowRegistry();
    // Replaces the class of the same map.
    void add(const SettingsWindowClass& windowClass);
    // nullptr when no window serves the map.
    const SettingsWindowClass* find(int map) const;

private:
    std::map<int, SettingsWindowClass> classes_;
};

}  // namespace kv
