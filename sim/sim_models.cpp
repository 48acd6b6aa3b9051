#include "sim/sim_models.h"

#include <QRegularExpression>
#include <QStringList>

namespace kv::sim {

namespace {
struct ModelRow {
    const char* text;
    int typeCode;
    int subType;  // KV720: the input type it leaves the factory with (mV)
};

constexpr ModelRow modelRows[] = {
    {"KV714-20", 1, 0},  {"KV714-10", 2, 0}, {"KV716-20", 3, 0},     {"KV720-20", 4, 1},
    {"KV720-10", 5, 1},  {"KV716-10", 6, 0}, {"KV714_KV718", 7, -1}, {"KV714-22", 7, 0},
    {"KV718-20", 7, 1},  {"KV714-12", 7, 2}, {"KV718-10", 7, 3},     {"KV716-22", 8, 0},
    {"KV716-23", 8, 1},  {"KV760-20", 9, 0}, {"KV760-10", 9, 1},     {"KV718-2A", 10, 1},
    {"KV718-1A", 10, 3},
};

struct FamilyRow {
    int typeCode;
    int family;
};

constexpr FamilyRow familyRows[] = {
    {1, 1}, {2, 1}, {3, 2}, {4, 3}, {5, 3}, {6, 2}, {7, 4}, {8, 5}, {9, 6}, {10, 7},
};

// Type codes whose model text depends on the sub-type.
bool textNamesSubType(int typeCode) {
    return typeCode >= 7;
}
}  // namespace

int FamilyOfType(int typeCode) {
    for (const FamilyRow& row : familyRows)
        if (row.typeCode == typeCode)
            return row.family;
    return 0;
}

bool ParseModel(const QString& text, ModuleIdentity& identity) {
    const QString wanted = text.trimmed().toUpper();
    for (const ModelRow& row : modelRows) {
        if (wanted == QLatin1String(row.text)) {
            identity.typeCode = row.typeCode;
            identity.subType = row.subType;
            return true;
        }
    }
    static const QRegularExpression codeForm(QStringLiteral("^(\\d{1,3})(?::(-?\\d{1,5}))?$"));
    const QRegularExpressionMatch match = codeForm.match(wanted);
    if (!match.hasMatch())
        return false;
    const int code = match.captured(1).toInt();
    if (code > 255)
        return false;
    identity.typeCode = code;
    identity.subType = 0;
    for (const ModelRow& row : modelRows) {
        if (row.typeCode == code) {
            identity.subType = row.subType;
            break;
        }
    }
    if (match.hasCaptured(2))
        identity.subType = match.captured(2).toInt();
    return true;
}

QString ModelName(int typeCode, int subType) {
    for (const ModelRow& row : modelRows) {
        if (row.typeCode == typeCode && (!textNamesSubType(typeCode) || row.subType == subType))
            return QLatin1String(row.text);
    }
    return QStringLiteral("type %1 sub-type %2").arg(typeCode).arg(subType);
}

QString KnownModels() {
    QStringList texts;
    for (const ModelRow& row : modelRows)
        texts << QLatin1String(row.text);
    return texts.join(QStringLiteral(", "));
}

}  // namespace kv::sim
