#pragma once
// The user's stored properties as a test reads, writes and empties them.

#include "engine/app_settings.h"

#include <QSettings>

namespace kv::test {

inline QSettings PropertyStore() {
    return QSettings(QSettings::NativeFormat, QSettings::UserScope, SettingsApplication,
                     SettingsApplication);
}

inline QVariant StoredProperty(const QString& key) {
    return PropertyStore().value(SettingsSection + QLatin1Char('/') + key);
}

inline void StoreProperty(const QString& key, const QVariant& value) {
    PropertyStore().setValue(SettingsSection + QLatin1Char('/') + key, value);
}

inline void ClearStoredProperties() {
    PropertyStore().clear();
}

}  // namespace kv::test
