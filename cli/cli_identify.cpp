#include "cli/cli_identify.h"

#include "model/entry_format.h"
#include "model/module_types.h"
#include "model/register_map.h"

namespace kv::cli {

QString IdentityText() {
    const QString rows[][2] = {
        {QStringLiteral("Model"), DisplayModuleType(RegVal.Mod_Type)},
        {QStringLiteral("Serial number"), QString::number(RegVal.Serial_No)},
        {QStringLiteral("Revision"), RevisionText(QString::number(RegVal.Revision))},
        {QStringLiteral("Bus ID"), QString::number(RegVal.Buss_ID)},
    };
    QString text;
    for (const auto& row : rows)
        text += row[0] + QLatin1Char('\t') + row[1] + QLatin1Char('\n');
    return text;
}

}  // namespace kv::cli
