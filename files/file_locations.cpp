#include "files/file_locations.h"

#include <QDir>

namespace kv {

QString DefaultFolder() {
    const QString override = qEnvironmentVariable("KV700_HOME");
    const QString folder =
        override.isEmpty() ? QDir::homePath() + QStringLiteral("/ORVE/KV700") : override;
    return folder.endsWith(QLatin1Char('/')) ? folder : folder + QLatin1Char('/');
}

QString AutoSaveFolder() {
    return DefaultFolder() + QStringLiteral("AutoSave/");
}

QString FileNameSafe(const QString& name) {
    static const QString forbidden = QStringLiteral("/\\:*?\"<>|");
    QString safe = name;
    for (QChar& c : safe)
        if (c.unicode() < 0x20 || c.unicode() == 0x7F || forbidden.contains(c))
            c = u'_';
    return safe;
}

QString ProposedSaveName(const QString& modelText, const QString& fileName) {
    return FileNameSafe(modelText + QLatin1Char('-') + fileName);
}

QString AutoSavePath(const QString& modelText, const QString& testerPart) {
    return AutoSaveFolder() + FileNameSafe(modelText + QLatin1Char('-') + testerPart) +
           QStringLiteral(".kv7");
}

}  // namespace kv
