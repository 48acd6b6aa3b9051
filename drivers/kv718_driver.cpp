#include "drivers/kv718_driver.h"

#include "drivers/kv718_input.h"
#include "drivers/read_back.h"
#include "drivers/step_runner.h"
#include "drivers/user_cal_step.h"
#include "model/range_table.h"
#include "model/register_values.h"

namespace kv {

namespace {

DriverWork work718;

// --- hooks of the programming order ---

bool startOfRun(StepContext& step, QString& text) {
    return KV718A_CaculateInCal(step.settings, ProgramRangeTable(Input1), RegVal, text);
}

// --- hook of the reading order ---

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
    s.Inp1Samples = KV718SamplesMs(RegVal.ST_Samples);
    KV718ReadFlagA(quint16(RegVal.Flag_A), s);
    if (!ReadUserRange(Output1Range, RegVal, s, warning))
        warning += QStringLiteral("Invalid Output 1 Range");
    ReadTable1(RegVal, s);
    return true;
}

using S = SettingsSet;
using W = DriverWork;
#define REG(member) KV_REG(member)

// clang-format off
const StepRow programOrder[] = {
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
    {On(REG(Meas_Unit_F)),            nullptr,            Write(REG(In_Rng1), Setting(&S::Inp1RngSet))},
    {On(REG(In_Rng1)),                nullptr,            Write(REG(Usr_In1_Z), Computed(REG(Usr_In1_Z)))},
    {On(REG(Usr_In1_Z)),              nullptr,            Write(REG(Usr_In1_F), Computed(REG(Usr_In1_F)))},
    {On(REG(Usr_In1_F)),              Output1Calibration, Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),               nullptr,            Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)),             nullptr,            Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)),             Limit1Calibration,  Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)),             nullptr,            Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt1_F)),             nullptr,            Write(REG(ST_Samples), Computed(REG(ST_Samples)))},
    {On(REG(ST_Samples)),             nullptr,            Write(REG(MIZ), Computed(REG(MIZ)))},
    {On(REG(MIZ)),                    nullptr,            Write(REG(Flag_A), Computed(REG(Flag_A)))},
    {On(REG(Flag_A)),                 nullptr,            FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),       nullptr,            Read(REG(Input_B4_Table))},
    {On(REG(Input_B4_Table)),         nullptr,            Write(REG(Buss_ID), Setting(&S::BussIdenti))},
};

const StepRow readOrder[] = {
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
    {On(REG(Sig_Lmt1_F)),             nullptr,    Read(REG(ST_Samples))},
    {On(REG(ST_Samples)),             nullptr,    Read(REG(MIZ))},
    {On(REG(MIZ)),                    nullptr,    Read(REG(Eng_Unit1))},
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
// clang-format on

const DriverDescriptor kv718{
    "modKV718vA",
    "GS718vA",
    Kv718AMap,
    "modKV718vA.cbSet",
    "GS718vA.cbGet",
    TableOf(programOrder),
    TableOf(readOrder),
    REG(Buss_ID),
    REG(Int_Temp),
    &work718,
    {"f_KV718vA", "KV718-xA Programmed", "f_KV718vA Unknown memory map",
     "f_KV718vA.cbGet Incorecct memory map", "f_KV718vA.cbGet Incorecct fail memory map"},
};

#undef REG

}  // namespace

const DriverDescriptor& Kv718Driver() {
    return kv718;
}

bool GS718vA(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text) {
    return Dispatch(kv718, engine, kind, requester, settings, id, busId, text);
}

}  // namespace kv
