#include "files/kv7_fields.h"

namespace kv {

const Kv7Field Kv7Fields[41] = {
    {"ModTypeSet", &SettingsSet::ModTypeSet},   {"SerialNumb", &SettingsSet::SerialNumb},
    {"BussIdenti", &SettingsSet::BussIdenti},   {"SoftwarRev", &SettingsSet::SoftwarRev},
    {"FileName", &SettingsSet::FileName},       {"UserLmtEna", &SettingsSet::UserLmtEna},
    {"DirecrReve", &SettingsSet::DirecrReve},   {"RemoteCont", &SettingsSet::RemoteCont},
    {"MinorTrim", &SettingsSet::MinorTrim},     {"Inp1RngTyp", &SettingsSet::Inp1RngTyp},
    {"Typ1Differ", &SettingsSet::Typ1Differ},   {"Inp1RngSet", &SettingsSet::Inp1RngSet},
    {"Typ1InRes", &SettingsSet::Typ1InRes},     {"Typ1InUnit", &SettingsSet::Typ1InUnit},
    {"Inp1MeUnit", &SettingsSet::Inp1MeUnit},   {"Inp1Shape", &SettingsSet::Inp1Shape},
    {"Inp1BurnOut", &SettingsSet::Inp1BurnOut}, {"Inp1EngZro", &SettingsSet::Inp1EngZro},
    {"Inp1EngFul", &SettingsSet::Inp1EngFul},   {"Inp1EngUnt", &SettingsSet::Inp1EngUnt},
    {"Inp1mU_Zro", &SettingsSet::Inp1mU_Zro},   {"Inp1mU_Ful", &SettingsSet::Inp1mU_Ful},
    {"Inp1Respon", &SettingsSet::Inp1Respon},   {"Inp1Samples", &SettingsSet::Inp1Samples},
    {"TrigMode", &SettingsSet::TrigMode},       {"TrigLevel", &SettingsSet::TrigLevel},
    {"Out1RngTyp", &SettingsSet::Out1RngTyp},   {"Out1EngZro", &SettingsSet::Out1EngZro},
    {"Out1EngFul", &SettingsSet::Out1EngFul},   {"Out1EngUnt", &SettingsSet::Out1EngUnt},
    {"Out1SigLmZ", &SettingsSet::Out1SigLmZ},   {"Out1SigLmF", &SettingsSet::Out1SigLmF},
    {"Out2RngTyp", &SettingsSet::Out2RngTyp},   {"Out2EngZro", &SettingsSet::Out2EngZro},
    {"Out2EngFul", &SettingsSet::Out2EngFul},   {"Out2EngUnt", &SettingsSet::Out2EngUnt},
    {"Out2SigLmZ", &SettingsSet::Out2SigLmZ},   {"Out2SigLmF", &SettingsSet::Out2SigLmF},
    {"AuxVmA", &SettingsSet::AuxVmA},           {"AuxIsI", &SettingsSet::AuxIsI},
    {"AuxImA", &SettingsSet::AuxImA},
};

const Kv7Table Kv7Tables[2] = {
    {"TableC", TableCPoints, [](SettingsSet& r) { return r.TableC.data(); },
     [](const SettingsSet& r) { return r.TableC.data(); }},
    {"Table1", Table1Points, [](SettingsSet& r) { return r.Table1.data(); },
     [](const SettingsSet& r) { return r.Table1.data(); }},
};

QString Kv7TableKey(const Kv7Table& table, int point) {
    return QLatin1String(table.name) + QLatin1Char('(') +
           QString::number(point).rightJustified(3, QLatin1Char('0')) + QLatin1Char(')');
}

}  // namespace kv
