#include "drivers/kv7146v1_driver.h"

#include "drivers/kv7146_flags.h"
#include "drivers/read_back.h"
#include "drivers/step_runner.h"
#include "drivers/user_cal_step.h"
#include "model/range_table.h"

namespace kv {

namespace {

// Shared by both models: only one run is active at a time.
DriverWork work7146v1;

// The input range row is in Inp1RngTyp; the input is calibrated in its units.
const UserRange engineeringInput{
    Input1,
    &RegMap::In_Rng1,
    &SettingsSet::Inp1RngTyp,
    nullptr,
    {&RegMap::Usr_In1_Z, &RegMap::Usr_In1_F, &SettingsSet::Inp1EngZro, &SettingsSet::Inp1EngFul,
     "In 1"},
    {nullptr, nullptr, nullptr, nullptr, nullptr},
};

// --- hooks of the programming orders ---

bool inputCalibration(StepContext& step, QString& text) {
    return CalibratePair(engineeringInput, engineeringInput.scale, step.settings, step.work, text);
}

// --- hooks of the reading orders ---

// The user counts come from RegVal as the module's identification (and any
// programming since) left them; the reading order refreshes the range rows.
void decodeCommon(StepContext& step) {
    SettingsSet& s = step.settings;
    QString& warning = step.work.DrvWarning;
    ReadModuleIdentity(RegVal, s);
    s.Inp1Respon = RegVal.Resp1;
    s.UserLmtEna = RegVal.Sig_Lmt_On;
    if (!ReadUserRange(engineeringInput, RegVal, s, warning))
        warning += QStringLiteral("Invalid Input 1 Range, ");
    if (!ReadUserRange(Output1Range, RegVal, s, warning))
        warning += QStringLiteral("Invalid Output 1 Range");
}

bool decodeKv714(StepContext& step, QString&) {
    decodeCommon(step);
    return true;
}

bool decodeKv716(StepContext& step, QString&) {
    decodeCommon(step);
    step.settings.DirecrReve = RegVal.IO_Dir;
    if (!ReadUserRange(Output2Range, RegVal, step.settings, step.work.DrvWarning))
        step.work.DrvWarning += QStringLiteral("Invalid Output 2 Range");
    return true;
}

using S = SettingsSet;
using W = DriverWork;
#define REG(member) KV_REG(member)

// Each pair goes full scale first, then zero.
// clang-format off
const StepRow kv714ProgramOrder[] = {
    // acknowledged       work                next write
    {On(REG(Mod_Type)),   inputCalibration,   Write(REG(In_Rng1), Setting(&S::Inp1RngTyp))},
    {On(REG(In_Rng1)),    nullptr,            Write(REG(Usr_In1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_In1_F)),  nullptr,            Write(REG(Usr_In1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_In1_Z)),  nullptr,            Write(REG(Resp1), Setting(&S::Inp1Respon))},
    {On(REG(Resp1)),      nullptr,            Write(REG(Sig_Lmt_On), Setting(&S::UserLmtEna))},
    {On(REG(Sig_Lmt_On)), Output1Calibration, Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),   nullptr,            Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)), nullptr,            Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)), Limit1Calibration,  Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt1_F)), nullptr,            Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)), nullptr,            Write(REG(Buss_ID), Setting(&S::BussIdenti))},
};

// Output 2 goes completely before output 1.
const StepRow kv716ProgramOrder[] = {
    // acknowledged       work                next write
    {On(REG(Mod_Type)),   inputCalibration,   Write(REG(In_Rng1), Setting(&S::Inp1RngTyp))},
    {On(REG(In_Rng1)),    nullptr,            Write(REG(Usr_In1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_In1_F)),  nullptr,            Write(REG(Usr_In1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_In1_Z)),  nullptr,            Write(REG(Resp1), Setting(&S::Inp1Respon))},
    {On(REG(Resp1)),      nullptr,            Write(REG(Sig_Lmt_On), Setting(&S::UserLmtEna))},
    {On(REG(Sig_Lmt_On)), Output2Calibration, Write(REG(Out_Rng2), Setting(&S::Out2RngTyp))},
    {On(REG(Out_Rng2)),   nullptr,            Write(REG(Usr_Out2_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out2_F)), nullptr,            Write(REG(Usr_Out2_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out2_Z)), Limit2Calibration,  Write(REG(Sig_Lmt2_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt2_F)), nullptr,            Write(REG(Sig_Lmt2_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt2_Z)), Output1Calibration, Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),   nullptr,            Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)), nullptr,            Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)), Limit1Calibration,  Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt1_F)), nullptr,            Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)), nullptr,            Write(REG(IO_Dir), Setting(&S::DirecrReve))},
    {On(REG(IO_Dir)),     nullptr,            Write(REG(Buss_ID), Setting(&S::BussIdenti))},
};

const StepRow kv714ReadOrder[] = {
    {On(REG(Mod_Type)),   nullptr,     Read(REG(Buss_ID))},
    {On(REG(Buss_ID)),    nullptr,     Read(REG(Sig_Lmt_On))},
    {On(REG(Sig_Lmt_On)), nullptr,     Read(REG(In_Rng1))},
    {On(REG(In_Rng1)),    nullptr,     Read(REG(Out_Rng1))},
    {On(REG(Out_Rng1)),   decodeKv714, Read(REG(Int_Temp))},
};

const StepRow kv716ReadOrder[] = {
    {On(REG(Mod_Type)),   nullptr,     Read(REG(Buss_ID))},
    {On(REG(Buss_ID)),    nullptr,     Read(REG(Sig_Lmt_On))},
    {On(REG(Sig_Lmt_On)), nullptr,     Read(REG(IO_Dir))},
    {On(REG(IO_Dir)),     nullptr,     Read(REG(In_Rng1))},
    {On(REG(In_Rng1)),    nullptr,     Read(REG(Out_Rng2))},
    {On(REG(Out_Rng2)),   nullptr,     Read(REG(Out_Rng1))},
    {On(REG(Out_Rng1)),   decodeKv716, Read(REG(Int_Temp))},
};
// clang-format on

const RunTexts runTexts714{"f_KV714", "KV714 Programmed", "f_KV714 Unknown memory map",
                           "f_KV714.cbGet Incorecct memory map",
                           "f_KV714.cbGet Incorecct fail memory map"};
const RunTexts runTexts716{"f_KV714", "KV716 Programmed", "f_KV714 Unknown memory map",
                           "f_KV714.cbGet Incorecct memory map",
                           "f_KV714.cbGet Incorecct fail memory map"};

const DriverDescriptor kv714v1{
    "modKV7146v1",
    "GS714v1",
    KV714v1,
    "modKV7146v1.cbSet",
    "GS7146v1.cbGet",
    TableOf(kv714ProgramOrder),
    TableOf(kv714ReadOrder),
    REG(Buss_ID),
    REG(Int_Temp),
    &work7146v1,
    runTexts714,
};

const DriverDescriptor kv716v1{
    "modKV7146v1",
    "GS716v1",
    KV716v1,
    "modKV7146v1.cbSet",
    "GS7146v1.cbGet",
    TableOf(kv716ProgramOrder),
    TableOf(kv716ReadOrder),
    REG(Buss_ID),
    REG(Int_Temp),
    &work7146v1,
    runTexts716,
};

#undef REG

}  // namespace

const DriverDescriptor& Kv714v1Driver() {
    return kv714v1;
}

const DriverDescriptor& Kv716v1Driver() {
    return kv716v1;
}

bool GS714v1(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text) {
    return Dispatch(kv714v1, engine, kind, requester, settings, id, busId, text);
}

bool GS716v1(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text) {
    return Dispatch(kv716v1, engine, kind, requester, settings, id, busId, text);
}

}  // namespace kv
