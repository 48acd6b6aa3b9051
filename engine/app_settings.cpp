#include "engine/app_settings.h"

#include <QSettings>

#include <limits>
#include <optional>

namespace kv {

namespace {
bool connectionFrozen = false;

// The "Properties" section of the user's settings store.
struct PropertyStore {
    PropertyStore() { settings.beginGroup(SettingsSection); }
    QSettings settings{QSettings::NativeFormat, QSettings::UserScope, SettingsApplication,
                       SettingsApplication};
};

std::optional<QString> storedText(const QString& key) {
    const QVariant value = PropertyStore().settings.value(key);
    if (!value.isValid())
        return std::nullopt;
    return value.toString();
}

std::optional<qint16> asShort(const QString& text) {
    bool ok = false;
    const int value = text.trimmed().toInt(&ok);
    if (!ok || value < std::numeric_limits<qint16>::min() ||
        value > std::numeric_limits<qint16>::max())
        return std::nullopt;
    return qint16(value);
}
}  // namespace

StoredProperties LoadProperties(qint16 enginePort, qint16 engineConnector) {
    StoredProperties properties{enginePort, engineConnector, DefaultColourTheme};

    if (const auto text = storedText(KeyColourTheme)) {
        const auto theme = asShort(*text);
        properties.colourTheme = theme && (*theme == 0 || *theme == 1) ? *theme : 0;
    }
    if (const auto text = storedText(KeyCommPort))
        properties.commPort = asShort(*text).value_or(enginePort);
    if (const auto text = storedText(KeyConnector))
        properties.connector = asShort(*text).value_or(1);
    return properties;
}

void SaveProperty(const QString& key, qint16 value) {
    if (connectionFrozen && key != KeyColourTheme)
        return;
    PropertyStore().settings.setValue(key, QString::number(value));
}

void SetConnectionPropertiesFrozen(bool frozen) {
    connectionFrozen = frozen;
}

}  // namespace kv
