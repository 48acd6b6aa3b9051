#include "model/module_types.h"

#include "engine/diagnostics.h"
#include "model/register_map.h"

namespace kv {

namespace {

struct ModuleType {
    qint32 code;
    int map;
    const char* text;  // the model text, or the prefix of a sub-type not listed below
    bool bySubType;
};

struct SubTypeText {
    qint32 code;
    qint16 subType;
    const char* text;
};

// clang-format off
const ModuleType moduleTypes[] = {
    {1,  1, "KV714-20",  false},
    {2,  1, "KV714-10",  false},
    {3,  2, "KV716-20",  false},
    {4,  3, "KV720-20",  false},
    {5,  3, "KV720-10",  false},
    {6,  2, "KV716-10",  false},
    {7,  4, "KV714/8-",  true},
    {8,  5, "KV716-v2-", true},
    {9,  6, "KV760v1-",  true},
    {10, 7, "KV718-?\?-", true},
};

const SubTypeText subTypeTexts[] = {
    {7, -1, "KV714_KV718"},
    {7,  0, "KV714-22"},
    {7,  1, "KV718-20"},
    {7,  2, "KV714-12"},
    {7,  3, "KV718-10"},
    {8,  0, "KV716-22"},
    {8,  1, "KV716-23"},
    {9,  0, "KV760-20"},
    {9,  1, "KV760-10"},
    {10, 1, "KV718-2A"},
    {10, 3, "KV718-1A"},
};

const char* const familyNames[] = {
    " is not KV714!", " is not KV716!", " is not KV720!", " is not KV714 v2!",
    " is not KV716 v2!", " is not KV760 v1!", " is not KV718-xA!",
};
// clang-format on

const ModuleType* findType(qint32 typeCode) {
    for (const ModuleType& type : moduleTypes)
        if (type.code == typeCode)
            return &type;
    return nullptr;
}

}  // namespace

int GetModMap(qint32 typeCode) {
    const ModuleType* type = findType(typeCode);
    return type ? type->map : UnknownModuleMap;
}

QString ModelText(qint32 typeCode, qint16 subType) {
    const ModuleType* type = findType(typeCode);
    if (!type)
        return QStringLiteral("KV ?");
    if (!type->bySubType)
        return QLatin1String(type->text);
    for (const SubTypeText& known : subTypeTexts)
        if (known.code == typeCode && known.subType == subType)
            return QLatin1String(known.text);
    return QLatin1String(type->text) + QString::number(subType);
}

QString DisplayModuleType(qint32 typeCode) {
    if (!findType(typeCode)) {
        ModuleMap = UnknownModuleMap;
        DebugMessage(DiagGeneral, QStringLiteral("DisplayModuleType"), QStringLiteral("?"));
    }
    return ModelText(typeCode, RegVal.TypInput);
}

bool CheckModType(qint32 typeCode, int family, QString& message) {
    if (family < 1 || family > MapCount) {
        message = QStringLiteral("CheckModType: ? !");
        return false;
    }
    if (GetModMap(typeCode) == family)
        return true;
    message = ModelText(typeCode, RegVal.TypInput) + QLatin1String(familyNames[family - 1]);
    return false;
}

}  // namespace kv
