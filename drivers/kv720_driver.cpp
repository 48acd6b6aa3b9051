#include "drivers/kv720_driver.h"

#include "drivers/kv720_codes.h"
#include "drivers/kv720_input.h"
#include "drivers/kv720_read.h"
#include "drivers/step_runner.h"
#include "model/codec.h"
#include "model/entry_number.h"
#include "model/entry_user_cal.h"
#include "model/linearisation.h"
#include "model/range_table.h"

namespace kv {

namespace {

constexpr double PauseSeconds = 0.1;
constexpr int LastRange = RangeEntries - 1;

DriverWork work720;

quint16 withBit(quint16 flags, int bit, bool on) {
    return on ? SetBit(flags, bit) : ClearBit(flags, bit);
}

bool toCount(double value, qint32& count, QString& text) {
    if (RoundToLong(value, count))
        return true;
    text = QStringLiteral("Invalid Input Cal Values");
    return false;
}

// --- hooks of the programming order ---

bool startOfRun(StepContext& step, QString& text) {
    return Kv720StartInput(step.settings, step.work, text);
}

bool selectInputRange(StepContext& step, QString& text) {
    const DriverWork& w = step.work;
    return Kv720MilliVoltChecks(w.DrvInLo, w.DrvInHi, text) &&
           Kv720SelectInputRange(ProgramRangeTable(Input1), w.DrvInLo, w.DrvInHi, w.DrvInOffset,
                                 step.settings.Inp1RngSet, text);
}

bool verifyInputRange(StepContext& step, QString& text) {
    if (RegVal.In_Rng1 != step.settings.Inp1RngSet) {
        text.clear();
        return false;
    }
    step.work.DrvInCh =
        qint16(withBit(quint16(step.work.DrvInCh), Kv720RemoteBit, step.settings.RemoteCont != 0));
    return true;
}

bool pauseForInputCal(StepContext&, QString&) {
    AddDelay(PauseSeconds, QStringLiteral("Input Cal Values"));
    return true;
}

bool inputCalibration(StepContext& step, QString& text) {
    SettingsSet& s = step.settings;
    if (!Kv720AuxChecks(s, text))
        return false;
    if (s.Inp1RngSet < 1 || s.Inp1RngSet > LastRange) {
        text = QStringLiteral("Invalid Input Cal Values");
        return false;
    }
    const double rangeFull = ProgramRangeTable(Input1)[s.Inp1RngSet].maximum;
    Kv720InputCounts counts;
    if (!Kv720InputCalibration(rangeFull, RegVal, step.work.DrvInLo, step.work.DrvInHi, counts,
                               text))
        return false;
    quint16 flags = withBit(quint16(RegVal.Flag_A), Kv720OffsetBit, counts.offsetBit);
    qint32 auxCount = 0;
    if (!toCount(Kv720AuxCount(s, RegVal, flags), auxCount, text))
        return false;
    // Burn-out detection belongs to thermocouples; other inputs leave it off.
    const bool thermocouple = s.Inp1RngTyp == Kv720Thermocouple;
    flags = withBit(flags, Kv720BurnOutBit, thermocouple && s.Inp1BurnOut >= 1);
    flags = withBit(flags, Kv720BurnOutDownBit, thermocouple && s.Inp1BurnOut == 2);
    if (thermocouple &&
        !BuildTableC(s.TableC, 0.0, rangeFull, s.Inp1Shape, text, RegVal.CIN_F, RegVal.CIN_Z))
        return false;
    flags = withBit(flags, Kv720ResponseBit, s.Inp1Respon == 1);
    flags = withBit(flags, Kv720LimitsBit, s.UserLmtEna == 1);
    flags = withBit(flags, Kv720ReverseBit, s.DirecrReve == 1);

    qint32 zero = 0;
    qint32 full = 0;
    if (!toCount(counts.zero, zero, text) || !toCount(counts.full, full, text))
        return false;
    RegVal.Usr_In1_Z = zero;
    RegVal.Usr_In1_F = full;
    RegVal.Aux_C = auxCount;
    RegVal.Flag_A = qint16(flags);
    RegVal.Orig_OS_PWM = zero;
    RegVal.Gain_Factor = Kv720UntrimmedGain;
    RegVal.Orig_FlagA = RegVal.Flag_A;
    return true;
}

bool thermocoupleInput(const StepContext& step) {
    return step.settings.Inp1RngTyp == Kv720Thermocouple;
}

bool verifyOutputRange(StepContext& step, QString& text) {
    if (RegVal.Out_Rng1 != step.settings.Out1RngTyp) {
        text = QStringLiteral("Verify Output Range");
        return false;
    }
    AddDelay(PauseSeconds, QStringLiteral("Output Cal Values"));
    return true;
}

bool outputCounts(StepContext& step, float zero, float full, QString& text) {
    if (RegVal.Out_Rng1 < 0 || RegVal.Out_Rng1 > LastRange) {
        text = QStringLiteral("Invalid Output 1 Range");
        return false;
    }
    RangeDescriptor row = ProgramRangeTable(Output1)[RegVal.Out_Rng1];
    row.countMin = RegVal.COUT_Z;
    row.countMax = RegVal.COUT_F;
    return UsrCalRangeSet(row, zero, full, step.work.DrvOutZ, step.work.DrvOutF, text);
}

bool outputCalibration(StepContext& step, QString& text) {
    return outputCounts(step, step.settings.Out1EngZro, step.settings.Out1EngFul, text);
}

bool limitCalibration(StepContext& step, QString& text) {
    return outputCounts(step, step.settings.Out1SigLmZ, step.settings.Out1SigLmF, text);
}

// --- hook of the reading order ---

bool decodeRead(StepContext& step, QString&) {
    Kv720DecodeRead(step.settings, step.work);
    step.work.DrvBusID = 16;
    return true;
}

using S = SettingsSet;
using W = DriverWork;
#define REG(member) KV_REG(member)

// clang-format off
const StepRow programOrder[] = {
    // acknowledged                       work               next request
    {On(REG(Mod_Type)),                   startOfRun,        Write(REG(TypInput), Setting(&S::Inp1RngTyp))},
    {On(REG(TypInput)),                   nullptr,           FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)),     nullptr,           Write(REG(Eng_Unit1), CharOf(&S::Inp1EngUnt, 0))},
    {On(REG(Eng_Unit1)),                  nullptr,           Write(REG(Eng_Unit2), CharOf(&S::Inp1EngUnt, 1))},
    {On(REG(Eng_Unit2)),                  nullptr,           Write(REG(Eng_Unit3), CharOf(&S::Inp1EngUnt, 2))},
    {On(REG(Eng_Unit3)),                  nullptr,           Write(REG(Eng_Unit4), CharOf(&S::Inp1EngUnt, 3))},
    {On(REG(Eng_Unit4)),                  nullptr,           Write(REG(Eng_In_Z), Setting(&S::Inp1EngZro))},
    {On(REG(Eng_In_Z)),                   nullptr,           Write(REG(Eng_In_F), Setting(&S::Inp1EngFul))},
    {On(REG(Eng_In_F)),                   nullptr,           Write(REG(Meas_Unit_Z), Setting(&S::Inp1mU_Zro))},
    {On(REG(Meas_Unit_Z)),                nullptr,           Write(REG(Meas_Unit_F), Setting(&S::Inp1mU_Ful))},
    {On(REG(Meas_Unit_F)),                nullptr,           Write(REG(Buss_ID), Setting(&S::BussIdenti))},
    {On(REG(Buss_ID)),                    selectInputRange,  Write(REG(In_Rng1), Setting(&S::Inp1RngSet))},
    {On(REG(In_Rng1)),                    verifyInputRange,  Write(REG(in_ch), Work(&W::DrvInCh))},
    {On(REG(in_ch)),                      nullptr,           Write(REG(in_res), Work(&W::DrvInRes))},
    {On(REG(in_res)),                     nullptr,           Write(REG(Type_In_Unit), Setting(&S::Typ1InUnit))},
    {On(REG(Type_In_Unit)),               pauseForInputCal,  Read(REG(CIN_Z))},
    {On(REG(CIN_Z)),                      nullptr,           Read(REG(CIN_F))},
    {On(REG(CIN_F)),                      nullptr,           Read(REG(SLOP_P))},
    {On(REG(SLOP_P)),                     nullptr,           Read(REG(SLOP_N))},
    {On(REG(SLOP_N)),                     inputCalibration,  Write(REG(Usr_In1_Z), Computed(REG(Usr_In1_Z)))},
    {On(REG(Usr_In1_Z)),                  nullptr,           Write(REG(Usr_In1_F), Computed(REG(Usr_In1_F)))},
    {On(REG(Usr_In1_F)),                  nullptr,           Write(REG(Aux_C), Computed(REG(Aux_C)))},
    {On(REG(Aux_C)),                      nullptr,           Write(REG(Flag_A), Computed(REG(Flag_A)))},
    {On(REG(Flag_A)),                     nullptr,           Write(REG(Orig_OS_PWM), Computed(REG(Orig_OS_PWM)))},
    {On(REG(Orig_OS_PWM)),                nullptr,           Write(REG(Orig_FlagA), Computed(REG(Orig_FlagA)))},
    {On(REG(Orig_FlagA)),                 nullptr,           Write(REG(Gain_Factor), Computed(REG(Gain_Factor)))},
    {On(REG(Gain_Factor), thermocoupleInput), nullptr,       FirstTablePart(REG(TableC))},
    {On(REG(Gain_Factor)),                nullptr,           FirstTablePart(REG(Table1))},
    {OnTableParts(REG(TableC)),           nullptr,           Read(REG(Term_Temp))},
    {On(REG(Term_Temp)),                  nullptr,           FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),           nullptr,           Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),             nullptr,           Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),                   verifyOutputRange, Read(REG(COUT_Z))},
    {On(REG(COUT_Z)),                     nullptr,           Read(REG(COUT_F))},
    {On(REG(COUT_F)),                     outputCalibration, Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)),                 nullptr,           Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)),                 limitCalibration,  Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)),                 nullptr,           Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
};

const StepRow readOrder[] = {
    {On(REG(Mod_Type)),                   nullptr,           Read(REG(Buss_ID))},
    {On(REG(Buss_ID)),                    nullptr,           FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)),     nullptr,           Read(REG(TypInput))},
    {On(REG(TypInput)),                   nullptr,           Read(REG(Type_In_Unit))},
    {On(REG(Type_In_Unit)),               nullptr,           Read(REG(In_Rng1))},
    {On(REG(In_Rng1)),                    nullptr,           Read(REG(Meas_Unit_Z))},
    {On(REG(Meas_Unit_Z)),                nullptr,           Read(REG(Meas_Unit_F))},
    {On(REG(Meas_Unit_F)),                nullptr,           Read(REG(Eng_In_F))},
    {On(REG(Eng_In_F)),                   nullptr,           Read(REG(Eng_In_Z))},
    {On(REG(Eng_In_Z)),                   nullptr,           Read(REG(in_ch))},
    {On(REG(in_ch)),                      nullptr,           Read(REG(in_res))},
    {On(REG(in_res)),                     nullptr,           Read(REG(Flag_A))},
    {On(REG(Flag_A)),                     nullptr,           Read(REG(Out_Rng1))},
    {On(REG(Out_Rng1)),                   nullptr,           Read(REG(Usr_Out1_Z))},
    {On(REG(Usr_Out1_Z)),                 nullptr,           Read(REG(Usr_Out1_F))},
    {On(REG(Usr_Out1_F)),                 nullptr,           Read(REG(Sig_Lmt1_Z))},
    {On(REG(Sig_Lmt1_Z)),                 nullptr,           Read(REG(Sig_Lmt1_F))},
    {On(REG(Sig_Lmt1_F)),                 nullptr,           Read(REG(COUT_Z))},
    {On(REG(COUT_Z)),                     nullptr,           Read(REG(COUT_F))},
    {On(REG(COUT_F)),                     nullptr,           Read(REG(Aux_C))},
    {On(REG(Aux_C)),                      nullptr,           Read(REG(IS_ZS1))},
    {On(REG(IS_ZS1)),                     nullptr,           Read(REG(IS_FS1))},
    {On(REG(IS_FS1)),                     nullptr,           Read(REG(IS_ZS2))},
    {On(REG(IS_ZS2)),                     nullptr,           Read(REG(IS_FS2))},
    {On(REG(IS_FS2)),                     nullptr,           Read(REG(Eng_Unit1))},
    {On(REG(Eng_Unit1)),                  nullptr,           Read(REG(Eng_Unit2))},
    {On(REG(Eng_Unit2)),                  nullptr,           Read(REG(Eng_Unit3))},
    {On(REG(Eng_Unit3)),                  nullptr,           Read(REG(Eng_Unit4))},
    {On(REG(Eng_Unit4)),                  nullptr,           Read(REG(Orig_OS_PWM))},
    {On(REG(Orig_OS_PWM)),                nullptr,           Read(REG(Orig_FlagA))},
    {On(REG(Orig_FlagA)),                 nullptr,           Read(REG(Gain_Factor))},
    {On(REG(Gain_Factor)),                nullptr,           FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),           nullptr,           Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),             decodeRead,        Read(REG(Int_Temp))},
};
// clang-format on

const DriverDescriptor kv720{
    "modKV720",
    "GS720",
    Kv720Map,
    "modKV720.cbSet",
    "modKV720.cbGet",
    TableOf(programOrder),
    TableOf(readOrder),
    REG(Sig_Lmt1_F),
    REG(Int_Temp),
    &work720,
    {"frmKV720", "Programmed", "", "", ""},
};

#undef REG

}  // namespace

const DriverDescriptor& Kv720Driver() {
    return kv720;
}

bool GS720(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings, qint32 id,
           qint16 busId, QString& text) {
    return Dispatch(kv720, engine, kind, requester, settings, id, busId, text);
}

}  // namespace kv
