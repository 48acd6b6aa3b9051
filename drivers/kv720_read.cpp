#include "drivers/kv720_read.h"

#include "drivers/kv720_codes.h"
#include "drivers/kv720_input.h"
#include "model/codec.h"
#include "model/entry_user_cal.h"
#include "model/linearisation.h"
#include "model/register_values.h"
#include "model/table_transfer.h"

namespace kv {

namespace {

constexpr int LastRange = RangeEntries - 1;

qint32 bit(quint16 flags, int n) {
    return TestBit(flags, n) ? 1 : 0;
}

void decodeOutput(SettingsSet& settings, DriverWork& work) {
    settings.Out1RngTyp = RegVal.Out_Rng1;
    if (RegVal.Out_Rng1 < 0 || RegVal.Out_Rng1 > LastRange) {
        work.DrvWarning += QStringLiteral("Invalid Output 1 Range, ");
        settings.Out1EngZro = 0.0f;
        settings.Out1EngFul = 0.0f;
        return;
    }
    RangeDescriptor row = ProgramRangeTable(Output1)[RegVal.Out_Rng1];
    row.countMin = RegVal.COUT_Z;
    row.countMax = RegVal.COUT_F;
    UserCalToEng(row, RegVal.Usr_Out1_Z, RegVal.Usr_Out1_F, settings.Out1EngZro,
                 settings.Out1EngFul, settings.Out1EngUnt, work.DrvWarning,
                 QStringLiteral("Out 1"));
    UserCalToEng(row, RegVal.Sig_Lmt1_Z, RegVal.Sig_Lmt1_F, settings.Out1SigLmZ,
                 settings.Out1SigLmF, settings.Out1EngUnt, work.DrvWarning,
                 QStringLiteral("Limit 1"));
}

void decodeInputOptions(SettingsSet& settings) {
    const quint16 channel = quint16(RegVal.in_ch);
    settings.Typ1Differ = bit(channel, Kv720DifferentialBit);
    settings.RemoteCont = bit(channel, Kv720RemoteBit);
    // The impedance register holds 1 for a normal input and the channel value
    // (3 or 4) for a loaded one; any other value reads as loaded too.
    settings.Typ1InRes = RegVal.in_res > 1 ? 1 : 0;

    const quint16 flags = quint16(RegVal.Flag_A);
    settings.Inp1Respon = bit(flags, Kv720ResponseBit);
    settings.UserLmtEna = bit(flags, Kv720LimitsBit);
    settings.DirecrReve = bit(flags, Kv720ReverseBit);
    settings.Inp1BurnOut =
        !TestBit(flags, Kv720BurnOutBit) ? 0 : (TestBit(flags, Kv720BurnOutDownBit) ? 2 : 1);
    const bool untrimmed = RegVal.Orig_FlagA == RegVal.Flag_A &&
                           RegVal.Gain_Factor == Kv720UntrimmedGain &&
                           RegVal.Usr_In1_Z == RegVal.Orig_OS_PWM;
    settings.MinorTrim = untrimmed ? 0 : 1;
}

}  // namespace

void Kv720DecodeRead(SettingsSet& settings, DriverWork& work) {
    settings.ModTypeSet = RegVal.Mod_Type;
    settings.SerialNumb = RegVal.Serial_No;
    settings.BussIdenti = RegVal.Buss_ID;
    settings.SoftwarRev = RegVal.Revision;

    settings.Inp1RngTyp = RegVal.TypInput;
    settings.Inp1RngSet = RegVal.In_Rng1;
    settings.Typ1InUnit = RegVal.Type_In_Unit;
    settings.Inp1mU_Zro = RegVal.Meas_Unit_Z;
    settings.Inp1mU_Ful = RegVal.Meas_Unit_F;
    settings.Inp1EngZro = RegVal.Eng_In_Z;
    settings.Inp1EngFul = RegVal.Eng_In_F;
    decodeInputOptions(settings);
    settings.Inp1MeUnit = Kv720UnitText(settings.Inp1RngTyp, Kv720UnitCode(settings.Typ1InUnit));
    settings.Inp1Shape = Kv720ShapeText(settings.Inp1RngTyp, Kv720ShapeCode(settings.Typ1InUnit));

    decodeOutput(settings, work);

    if (!Kv720AuxFromCount(RegVal.Aux_C, quint16(RegVal.Flag_A), RegVal, settings.AuxVmA,
                           settings.AuxIsI))
        work.DrvWarning += QStringLiteral("kv720AuxRead failed ") + QStringLiteral(", ");

    settings.Inp1EngUnt = EngUnitText(RegVal);

    // A table whose checksum failed has been reported; the record keeps its own.
    QString checksum;
    if (CheckTableReadBack(RegVal.Table1_Pts.data(), Table1LastUsed, checksum))
        settings.Table1 = RegVal.Table1_Pts;
}

}  // namespace kv
