#pragma once
// The program's persistent per-user properties: COM port, adapter type and
// colour theme, each kept as the decimal text of a 16-bit integer.

#include <QString>

namespace kv {

inline const QString SettingsApplication = QStringLiteral("KV700 PC Programmer");
inline const QString SettingsSection = QStringLiteral("Properties");
inline const QString KeyCommPort = QStringLiteral("CommPort");
inline const QString KeyConnector = QStringLiteral("Connector");
inline const QString KeyColourTheme = QStringLiteral("ColourTheme");
inline const QString KeyComBuffer = QStringLiteral("ComBuffer");

constexpr qint16 DefaultColourTheme = 1;

struct StoredProperties {
    qint16 commPort;
    qint16 connector;
    qint16 colourTheme;
};

// The properties read at start-up. A missing or unreadable port or adapter
// type keeps the engine's current value; an adapter type that is not a number
// selects the second adapter; a theme other than 0 or 1 is 0.
StoredProperties LoadProperties(qint16 enginePort, qint16 engineConnector);

void SaveProperty(const QString& key, qint16 value);

// A demonstration run connects to a simulated port: it must leave the user's
// real port and adapter choice alone.
void SetConnectionPropertiesFrozen(bool frozen);

}  // namespace kv
