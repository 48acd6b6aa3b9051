#pragma once
// The fields of a settings file in the order they are written.

#include "model/settings_set.h"

#include <QString>
#include <variant>

namespace kv {

using IntField = qint32 SettingsSet::*;
using FloatField = float SettingsSet::*;
using TextField = QString SettingsSet::*;

struct Kv7Field {
    const char* key;
    std::variant<IntField, FloatField, TextField> member;
};

// A point table; its keys are the name, "(", the point as 3 digits and ")".
struct Kv7Table {
    const char* name;
    int points;
    qint32* (*data)(SettingsSet&);
    const qint32* (*constData)(const SettingsSet&);
};

// Single fields, then the tables (table C before table 1).
extern const Kv7Field Kv7Fields[41];
extern const Kv7Table Kv7Tables[2];

QString Kv7TableKey(const Kv7Table& table, int point);

}  // namespace kv
