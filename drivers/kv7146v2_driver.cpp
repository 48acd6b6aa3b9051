#include "drivers/kv7146v2_driver.h"

#include "drivers/kv7146_flags.h"
#include "drivers/read_back.h"
#include "drivers/step_runner.h"
#include "drivers/user_cal_step.h"
#include "model/range_table.h"
#include "model/register_values.h"

namespace kv {

namespace {

// Shared by both models: only one run is active at a time.
DriverWork work7146v2;

// The input is calibrated in measured units over the row in Inp1RngSet.
const UserRange measuredInput{
    Input1,
    &RegMap::In_Rng1,
    &SettingsSet::Inp1RngSet,
    nullptr,
    {&RegMap::Usr_In1_Z, &RegMap::Usr_In1_F, &SettingsSet::Inp1mU_Zro, &SettingsSet::Inp1mU_Ful,
     "In 1"},
    {nullptr, nullptr, nullptr, nullptr, nullptr},
};

// --- hooks of the programming orders ---

bool startOfRun(StepContext& step, QString&) {
    RegVal.Flag_A = qint16(KV7146v2FlagA(step.settings, step.driver.family));
    return true;
}

bool inputCalibration(StepContext& step, QString& text) {
    return CalibratePair(measuredInput, measuredInput.scale, step.settings, step.work, text);
}

// --- hook of the reading orders ---

bool decodeRead(StepContext& step, QString&) {
    SettingsSet& s = step.settings;
    QString& warning = step.work.DrvWarning;
    ReadModuleIdentity(RegVal, s);
    s.Inp1RngSet = RegVal.In_Rng1;
    s.Inp1mU_Zro = RegVal.Meas_Unit_Z;
    s.Inp1mU_Ful = RegVal.Meas_Unit_F;
    s.Inp1EngZro = RegVal.Eng_In_Z;
    s.Inp1EngFul = RegVal.Eng_In_F;
    s.Inp1EngUnt = EngUnitText(RegVal);
    KV7146v2ReadFlagA(quint16(RegVal.Flag_A), step.driver.family, s);
    if (!ReadUserRange(Output1Range, RegVal, s, warning))
        warning += QStringLiteral("Invalid Output 1 Range");
    if (step.driver.family == KV716v2 && !ReadUserRange(Output2Range, RegVal, s, warning))
        warning += QStringLiteral("Invalid Output 2 Range");
    ReadTable1(RegVal, s);
    return true;
}

using S = SettingsSet;
using W = DriverWork;
#define REG(member) KV_REG(member)

// Each pair goes zero first, then full scale.
// clang-format off
const StepRow kv714ProgramOrder[] = {
    // acknowledged                   work                next request
    {On(REG(Mod_Type)),               startOfRun,         FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)), nullptr,            Write(REG(Eng_Unit1), CharOf(&S::Inp1EngUnt, 0))},
    {On(REG(Eng_Unit1)),              nullptr,            Write(REG(Eng_Unit2), CharOf(&S::Inp1EngUnt, 1))},
    {On(REG(Eng_Unit2)),              nullptr,            Write(REG(Eng_Unit3), CharOf(&S::Inp1EngUnt, 2))},
    {On(REG(Eng_Unit3)),              nullptr,            Write(REG(Eng_Unit4), CharOf(&S::Inp1EngUnt, 3))},
    {On(REG(Eng_Unit4)),              nullptr,            Write(REG(Eng_In_Z), Setting(&S::Inp1EngZro))},
    {On(REG(Eng_In_Z)),               nullptr,            Write(REG(Eng_In_F), Setting(&S::Inp1EngFul))},
    {On(REG(Eng_In_F)),               nullptr,            Write(REG(Meas_Unit_Z), Setting(&S::Inp1mU_Zro))},
    {On(REG(Meas_Unit_Z)),            nullptr,            Write(REG(Meas_Unit_F), Setting(&S::Inp1mU_Ful))},
    {On(REG(Meas_Unit_F)),            inputCalibration,   Write(REG(In_Rng1), Setting(&S::Inp1RngSet))},
    {On(REG(In_Rng1)),                nullptr,            Write(REG(Usr_In1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_In1_Z)),              nullptr,            Write(REG(Usr_In1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_In1_F)),              Output1Calibration, Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),               nullptr,            Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)),             nullptr,            Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)),             Limit1Calibration,  Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)),             nullptr,            Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt1_F)),             nullptr,            Write(REG(Flag_A), Computed(REG(Flag_A)))},
    {On(REG(Flag_A)),                 nullptr,            FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),       nullptr,            Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),         nullptr,            Write(REG(Buss_ID), Setting(&S::BussIdenti))},
};

const StepRow kv716ProgramOrder[] = {
    // acknowledged                   work                next request
    {On(REG(Mod_Type)),               startOfRun,         FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)), nullptr,            Write(REG(Eng_Unit1), CharOf(&S::Inp1EngUnt, 0))},
    {On(REG(Eng_Unit1)),              nullptr,            Write(REG(Eng_Unit2), CharOf(&S::Inp1EngUnt, 1))},
    {On(REG(Eng_Unit2)),              nullptr,            Write(REG(Eng_Unit3), CharOf(&S::Inp1EngUnt, 2))},
    {On(REG(Eng_Unit3)),              nullptr,            Write(REG(Eng_Unit4), CharOf(&S::Inp1EngUnt, 3))},
    {On(REG(Eng_Unit4)),              nullptr,            Write(REG(Eng_In_Z), Setting(&S::Inp1EngZro))},
    {On(REG(Eng_In_Z)),               nullptr,            Write(REG(Eng_In_F), Setting(&S::Inp1EngFul))},
    {On(REG(Eng_In_F)),               nullptr,            Write(REG(Meas_Unit_Z), Setting(&S::Inp1mU_Zro))},
    {On(REG(Meas_Unit_Z)),            nullptr,            Write(REG(Meas_Unit_F), Setting(&S::Inp1mU_Ful))},
    {On(REG(Meas_Unit_F)),            inputCalibration,   Write(REG(In_Rng1), Setting(&S::Inp1RngSet))},
    {On(REG(In_Rng1)),                nullptr,            Write(REG(Usr_In1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_In1_Z)),              nullptr,            Write(REG(Usr_In1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_In1_F)),              Output1Calibration, Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),               nullptr,            Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)),             nullptr,            Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)),             Limit1Calibration,  Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)),             nullptr,            Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt1_F)),             Output2Calibration, Write(REG(Out_Rng2), Setting(&S::Out2RngTyp))},
    {On(REG(Out_Rng2)),               nullptr,            Write(REG(Usr_Out2_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out2_Z)),             nullptr,            Write(REG(Usr_Out2_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out2_F)),             Limit2Calibration,  Write(REG(Sig_Lmt2_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt2_Z)),             nullptr,            Write(REG(Sig_Lmt2_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt2_F)),             nullptr,            Write(REG(Flag_A), Computed(REG(Flag_A)))},
    {On(REG(Flag_A)),                 nullptr,            FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),       nullptr,            Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),         nullptr,            Write(REG(Buss_ID), Setting(&S::BussIdenti))},
};

const StepRow kv714ReadOrder[] = {
    {On(REG(Mod_Type)),               nullptr,    Read(REG(Buss_ID))},
    {On(REG(Buss_ID)),                nullptr,    FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)), nullptr,    Read(REG(TypInput))},
    {On(REG(TypInput)),               nullptr,    Read(REG(Meas_Unit_Z))},
    {On(REG(Meas_Unit_Z)),            nullptr,    Read(REG(Meas_Unit_F))},
    {On(REG(Meas_Unit_F)),            nullptr,    Read(REG(Eng_In_F))},
    {On(REG(Eng_In_F)),               nullptr,    Read(REG(Eng_In_Z))},
    {On(REG(Eng_In_Z)),               nullptr,    Read(REG(Flag_A))},
    {On(REG(Flag_A)),                 nullptr,    Read(REG(Out_Rng1))},
    {On(REG(Out_Rng1)),               nullptr,    Read(REG(Usr_Out1_Z))},
    {On(REG(Usr_Out1_Z)),             nullptr,    Read(REG(Usr_Out1_F))},
    {On(REG(Usr_Out1_F)),             nullptr,    Read(REG(Sig_Lmt1_Z))},
    {On(REG(Sig_Lmt1_Z)),             nullptr,    Read(REG(Sig_Lmt1_F))},
    {On(REG(Sig_Lmt1_F)),             nullptr,    Read(REG(Eng_Unit1))},
    {On(REG(Eng_Unit1)),              nullptr,    Read(REG(Eng_Unit2))},
    {On(REG(Eng_Unit2)),              nullptr,    Read(REG(Eng_Unit3))},
    {On(REG(Eng_Unit3)),              nullptr,    Read(REG(Eng_Unit4))},
    {On(REG(Eng_Unit4)),              nullptr,    Read(REG(Usr_In1_Z))},
    {On(REG(Usr_In1_Z)),              nullptr,    Read(REG(Usr_In1_F))},
    {On(REG(Usr_In1_F)),              nullptr,    Read(REG(In_Rng1))},
    {On(REG(In_Rng1)),                nullptr,    FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),       nullptr,    Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),         decodeRead, Read(REG(Int_Temp))},
};

const StepRow kv716ReadOrder[] = {
    {On(REG(Mod_Type)),               nullptr,    Read(REG(Buss_ID))},
    {On(REG(Buss_ID)),                nullptr,    FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)), nullptr,    Read(REG(TypInput))},
    {On(REG(TypInput)),               nullptr,    Read(REG(Meas_Unit_Z))},
    {On(REG(Meas_Unit_Z)),            nullptr,    Read(REG(Meas_Unit_F))},
    {On(REG(Meas_Unit_F)),            nullptr,    Read(REG(Eng_In_F))},
    {On(REG(Eng_In_F)),               nullptr,    Read(REG(Eng_In_Z))},
    {On(REG(Eng_In_Z)),               nullptr,    Read(REG(Flag_A))},
    {On(REG(Flag_A)),                 nullptr,    Read(REG(Out_Rng1))},
    {On(REG(Out_Rng1)),               nullptr,    Read(REG(Usr_Out1_Z))},
    {On(REG(Usr_Out1_Z)),             nullptr,    Read(REG(Usr_Out1_F))},
    {On(REG(Usr_Out1_F)),             nullptr,    Read(REG(Sig_Lmt1_Z))},
    {On(REG(Sig_Lmt1_Z)),             nullptr,    Read(REG(Sig_Lmt1_F))},
    {On(REG(Sig_Lmt1_F)),             nullptr,    Read(REG(Eng_Unit1))},
    {On(REG(Eng_Unit1)),              nullptr,    Read(REG(Eng_Unit2))},
    {On(REG(Eng_Unit2)),              nullptr,    Read(REG(Eng_Unit3))},
    {On(REG(Eng_Unit3)),              nullptr,    Read(REG(Eng_Unit4))},
    {On(REG(Eng_Unit4)),              nullptr,    Read(REG(Usr_In1_Z))},
    {On(REG(Usr_In1_Z)),              nullptr,    Read(REG(Usr_In1_F))},
    {On(REG(Usr_In1_F)),              nullptr,    Read(REG(Out_Rng2))},
    {On(REG(Out_Rng2)),               nullptr,    Read(REG(Usr_Out2_Z))},
    {On(REG(Usr_Out2_Z)),             nullptr,    Read(REG(Usr_Out2_F))},
    {On(REG(Usr_Out2_F)),             nullptr,    Read(REG(Sig_Lmt2_Z))},
    {On(REG(Sig_Lmt2_Z)),             nullptr,    Read(REG(Sig_Lmt2_F))},
    {On(REG(Sig_Lmt2_F)),             nullptr,    Read(REG(In_Rng1))},
    {On(REG(In_Rng1)),                nullptr,    FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),       nullptr,    Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),         decodeRead, Read(REG(Int_Temp))},
};
// clang-format on

const RunTexts runTexts714{"f_KV7146v2", "KV714/8 Programmed", "f_KV7146v2 Unknown memory map",
                           "f_KV7146v2.cbGet Incorecct memory map",
                           "f_KV7146v2.cbGet Incorecct fail memory map"};
const RunTexts runTexts716{"f_KV7146v2", "KV716 Programmed", "f_KV7146v2 Unknown memory map",
                           "f_KV7146v2.cbGet Incorecct memory map",
                           "f_KV7146v2.cbGet Incorecct fail memory map"};

const DriverDescriptor kv714v2{
    "modKV7146v2",
    "GS714v2",
    KV714v2,
    "modKV7146v2.cbSet",
    "GS7146v2.cbGet",
    TableOf(kv714ProgramOrder),
    TableOf(kv714ReadOrder),
    REG(Buss_ID),
    REG(Int_Temp),
    &work7146v2,
    runTexts714,
};

const DriverDescriptor kv716v2{
    "modKV7146v2",
    "GS716v2",
    KV716v2,
    "modKV7146v2.cbSet",
    "GS7146v2.cbGet",
    TableOf(kv716ProgramOrder),
    TableOf(kv716ReadOrder),
    REG(Buss_ID),
    REG(Int_Temp),
    &work7146v2,
    runTexts716,
};

#undef REG

}  // namespace

const DriverDescriptor& Kv714v2Driver() {
    return kv714v2;
}

const DriverDescriptor& Kv716v2Driver() {
    return kv716v2;
}

bool GS714v2(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text) {
    return Dispatch(kv714v2, engine, kind, requester, settings, id, busId, text);
}

bool GS716v2(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text) {
    return Dispatch(kv716v2, engine, kind, requester, settings, id, busId, text);
}

}  // namespace kv
