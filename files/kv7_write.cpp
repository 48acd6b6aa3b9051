#include "files/kv7_fields.h"
#include "files/kv7_file.h"
#include "model/entry_number.h"

#include <QDir>
#include <QFileInfo>
#include <QSaveFile>
#include <cmath>

namespace kv {

namespace {

// The format has no escaping and the file is Latin-1, so such texts would
// come back altered or break the file for every later reader.
bool textStorable(const char* key, const QString& text, QString& problem) {
    for (const QChar c : text) {
        QString what;
        if (c == u'"')
            what = QStringLiteral("a double quote");
        else if (c == u'\r' || c == u'\n')
            what = QStringLiteral("a line break");
        else if (c.unicode() > 0xFF)
            what = QStringLiteral("the character \"") + c + QLatin1Char('"');
        else
            continue;
        problem = QLatin1String(key) + QStringLiteral(" contains ") + what +
                  QStringLiteral(", which a settings file cannot hold");
        return false;
    }
    return true;
}

bool storable(const SettingsSet& record, QString& problem) {
    for (const Kv7Field& field : Kv7Fields) {
        if (const auto* text = std::get_if<TextField>(&field.member)) {
            if (!textStorable(field.key, record.*(*text), problem))
                return false;
        } else if (const auto* number = std::get_if<FloatField>(&field.member)) {
            if (!std::isfinite(record.*(*number))) {
                problem = QLatin1String(field.key) + QStringLiteral(" is not a finite number");
                return false;
            }
        }
    }
    return true;
}

QByteArray content(const SettingsSet& record) {
    QByteArray out;
    for (const Kv7Field& field : Kv7Fields)
        std::visit([&](auto member) { WF(out, QLatin1String(field.key), record.*member); },
                   field.member);
    for (const Kv7Table& table : Kv7Tables)
        for (int point = 0; point < table.points; ++point)
            WF(out, Kv7TableKey(table, point), table.constData(record)[point]);
    return out;
}

bool writeWhole(const QString& fileName, const QByteArray& bytes, QString& reason) {
    const QString folder = QFileInfo(fileName).absolutePath();
    if (!QDir().mkpath(folder)) {
        reason = QStringLiteral("Cannot create the folder ") + folder + QStringLiteral(" for");
        return false;
    }
    QSaveFile file(fileName);
    if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size() || !file.commit()) {
        reason = file.errorString();
        return false;
    }
    return true;
}

}  // namespace

void ApplyKv7Extension(QString& fileName) {
    if (fileName.right(4).compare(QLatin1String(".kv7"), Qt::CaseInsensitive) != 0)
        fileName += QLatin1String(".kv7");
}

void WF(QByteArray& out, const QString& key, qint32 value) {
    out += '"' + key.toLatin1() + "\"," + QByteArray::number(value) + "\r\n";
}

void WF(QByteArray& out, const QString& key, float value) {
    out += '"' + key.toLatin1() + "\"," + GeneralText(value).toLatin1() + "\r\n";
}

void WF(QByteArray& out, const QString& key, const QString& value) {
    out += '"' + key.toLatin1() + "\",\"" + value.toLatin1() + "\"\r\n";
}

bool SaveKVdef(QString& fileName, const SettingsSet& record) {
    ApplyKv7Extension(fileName);
    SettingsSet saved = record;
    saved.SetFileName(record.FileName);
    QString reason;
    if (!storable(saved, reason)) {
        fileName = reason;
        return false;
    }
    if (!writeWhole(fileName, content(saved), reason)) {
        fileName = reason + QLatin1Char(' ') + fileName;
        return false;
    }
    return true;
}

}  // namespace kv
