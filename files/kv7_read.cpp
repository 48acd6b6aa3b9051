#include "engine/diagnostics.h"
#include "files/kv7_fields.h"
#include "files/kv7_file.h"
#include "model/entry_format.h"
#include "model/entry_number.h"

#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>
#include <QStringDecoder>

namespace kv {

namespace {

// A settings file is about 5 KB; anything far larger is not one.
constexpr qint64 MaxFileBytes = 1 << 20;
constexpr int MaxLineLength = 4096;

struct Item {
    QString text;
    bool quoted = false;
};

bool readBytes(const QString& fileName, QByteArray& bytes, QString& reason) {
    const QFileInfo info(fileName);
    if (info.isDir()) {
        reason = QStringLiteral("Is a folder, not a file:");
        return false;
    }
    if (info.exists() && !info.isFile()) {
        reason = QStringLiteral("Not a regular file:");
        return false;
    }
    QFile file(fileName);
    if (!file.open(QIODevice::ReadOnly)) {
        reason = file.errorString();
        return false;
    }
    bytes = file.read(MaxFileBytes + 1);
    if (file.error() != QFileDevice::NoError) {
        reason = file.errorString();
        return false;
    }
    if (bytes.size() > MaxFileBytes) {
        reason = QStringLiteral("Too large for a settings file:");
        return false;
    }
    return true;
}

// Files from this program are Latin-1; files edited elsewhere are often UTF-8.
QString decode(QByteArray bytes) {
    if (bytes.startsWith("\xEF\xBB\xBF"))
        bytes.remove(0, 3);
    QStringDecoder utf8(QStringConverter::Utf8);
    const QString text = utf8.decode(bytes);
    return utf8.hasError() ? QString::fromLatin1(bytes) : text;
}

// Reads the item at pos: a quoted text taken as it is, or an unquoted text up
// to the next comma with its blanks trimmed. pos ends on the comma or the end.
bool readItem(const QString& line, qsizetype& pos, Item& item, QString& reason) {
    while (pos < line.size() && (line[pos] == u' ' || line[pos] == u'\t'))
        ++pos;
    if (pos < line.size() && line[pos] == u'"') {
        const qsizetype close = line.indexOf(QLatin1Char('"'), pos + 1);
        if (close < 0) {
            reason = QStringLiteral("a closing quote is missing");
            return false;
        }
        item = {line.mid(pos + 1, close - pos - 1), true};
        pos = close + 1;
        while (pos < line.size() && (line[pos] == u' ' || line[pos] == u'\t'))
            ++pos;
        if (pos < line.size() && line[pos] != u',') {
            reason = QStringLiteral("text follows a closing quote");
            return false;
        }
        return true;
    }
    qsizetype comma = line.indexOf(QLatin1Char(','), pos);
    if (comma < 0)
        comma = line.size();
    item = {line.mid(pos, comma - pos).trimmed(), false};
    pos = comma;
    return true;
}

bool splitLine(const QString& line, Item& key, Item& value, QString& reason) {
    qsizetype pos = 0;
    if (!readItem(line, pos, key, reason))
        return false;
    if (pos >= line.size()) {
        reason = QStringLiteral("%1 has no value").arg(key.text);
        return false;
    }
    ++pos;
    if (!readItem(line, pos, value, reason))
        return false;
    if (pos < line.size()) {
        reason = QStringLiteral("%1 has more than one value").arg(key.text);
        return false;
    }
    return true;
}

QString valueProblem(const QString& key, const Item& value, const char* problem) {
    return QStringLiteral("value \"%1\" of %2 %3")
        .arg(VarToText(value.text), key, QLatin1String(problem));
}

bool toLong(const QString& key, const Item& value, qint32& result, QString& reason) {
    double number = 0;
    if (!ParseDecimal(value.text, number)) {
        reason = valueProblem(key, value, "is not a number");
        return false;
    }
    if (!RoundToLong(number, result)) {
        reason = valueProblem(key, value, "does not fit a 32-bit integer");
        return false;
    }
    return true;
}

bool toFloat(const QString& key, const Item& value, float& result, QString& reason) {
    double number = 0;
    if (!ParseDecimal(value.text, number)) {
        reason = valueProblem(key, value, "is not a number");
        return false;
    }
    if (!ParseDecimal(value.text, result)) {
        reason = valueProblem(key, value, "is too large for a 32-bit floating value");
        return false;
    }
    return true;
}

const Kv7Field* findField(const QString& key) {
    for (const Kv7Field& field : Kv7Fields)
        if (key == QLatin1String(field.key))
            return &field;
    return nullptr;
}

const Kv7Table* findTable(const QString& key) {
    for (const Kv7Table& table : Kv7Tables)
        if (key.left(6) == QLatin1String(table.name))
            return &table;
    return nullptr;
}

bool storeField(const Kv7Field& field, const Item& value, SettingsSet& into, qint32& typeCode,
                QString& reason) {
    const QString key = QLatin1String(field.key);
    if (const auto* text = std::get_if<TextField>(&field.member)) {
        if (*text == &SettingsSet::FileName)
            into.SetFileName(value.text);
        else
            into.*(*text) = value.text;
        return true;
    }
    if (const auto* number = std::get_if<FloatField>(&field.member))
        return toFloat(key, value, into.*(*number), reason);
    const IntField member = std::get<IntField>(field.member);
    if (!toLong(key, value, into.*member, reason))
        return false;
    if (member == &SettingsSet::ModTypeSet)
        typeCode = into.ModTypeSet;
    return true;
}

// The point number is the number right after the parenthesis: TableC(052).
bool storePoint(const Kv7Table& table, const QString& key, const Item& value, SettingsSet& into,
                QString& reason) {
    static const QRegularExpression leadingNumber(QStringLiteral(R"(^\s*([+-]?\d+))"));
    const QRegularExpressionMatch match = leadingNumber.match(key.mid(7, 3));
    if (!match.hasMatch()) {
        reason = QStringLiteral("%1 names no table point").arg(key);
        return false;
    }
    const int point = match.captured(1).toInt();
    if (point < 0 || point >= table.points) {
        reason = QStringLiteral("%1 names point %2, outside 0 to %3")
                     .arg(key)
                     .arg(point)
                     .arg(table.points - 1);
        return false;
    }
    return toLong(key, value, table.data(into)[point], reason);
}

// Keys this program does not know are no error: the user sees them listed.
void noteUnknown(const QString& key, const Item& value, SettingsSet& into) {
    double number = 0;
    const QVariant shown =
        !value.quoted && ParseDecimal(value.text, number) ? QVariant(number) : QVariant(value.text);
    const QString text = VarToText(shown);
    into.LoadNote += QStringLiteral(", ") + key + QStringLiteral(": ") + text;
    DebugMessage(DiagGeneral, QStringLiteral("RestoreKVdef"), key + QLatin1Char(':') + text);
}

bool loadLine(const QString& line, SettingsSet& into, qint32& typeCode, QString& reason) {
    if (line.size() > MaxLineLength) {
        reason = QStringLiteral("too long (more than %1 characters)").arg(MaxLineLength);
        return false;
    }
    if (line.trimmed().isEmpty())
        return true;
    Item key;
    Item value;
    if (!splitLine(line, key, value, reason))
        return false;
    if (const Kv7Field* field = findField(key.text))
        return storeField(*field, value, into, typeCode, reason);
    if (const Kv7Table* table = findTable(key.text))
        return storePoint(*table, key.text, value, into, reason);
    noteUnknown(key.text, value, into);
    return true;
}

}  // namespace

bool RestoreKVdef(QString& fileName, qint32& typeCode, SettingsSet& into) {
    ApplyKv7Extension(fileName);
    typeCode = 0;
    QByteArray bytes;
    QString reason;
    if (!readBytes(fileName, bytes, reason)) {
        fileName = reason + QLatin1Char(' ') + fileName;
        return false;
    }
    into.LoadNote.clear();
    static const QRegularExpression lineEnd(QStringLiteral("\r\n|\r|\n"));
    const QStringList lines = decode(bytes).split(lineEnd);
    for (qsizetype i = 0; i < lines.size(); ++i) {
        if (!loadLine(lines[i], into, typeCode, reason)) {
            fileName = QStringLiteral("Line %1: %2 ").arg(i + 1).arg(reason) + fileName;
            return false;
        }
    }
    into.LoadNote += QStringLiteral(", ") + fileName;
    if (typeCode == 0) {
        fileName = QStringLiteral("ModTypeSet not found ") + fileName;
        return false;
    }
    return true;
}

bool RestoreKVdef(QString& fileName, qint32& typeCode) {
    return RestoreKVdef(fileName, typeCode, RestoredSet());
}

void CopyRestoredSet(SettingsSet& record) {
    record = RestoredSet();
}

}  // namespace kv
