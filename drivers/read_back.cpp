#include "drivers/read_back.h"

#include "model/linearisation.h"
#include "model/table_transfer.h"

namespace kv {

void ReadModuleIdentity(const RegMap& values, SettingsSet& settings) {
    settings.ModTypeSet = values.Mod_Type;
    settings.SerialNumb = values.Serial_No;
    settings.BussIdenti = values.Buss_ID;
    settings.SoftwarRev = values.Revision;
}

void ReadTable1(const RegMap& values, SettingsSet& settings) {
    QString checksum;
    if (CheckTableReadBack(values.Table1_Pts.data(), Table1LastUsed, checksum))
        settings.Table1 = values.Table1_Pts;
}

}  // namespace kv
