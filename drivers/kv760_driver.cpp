#include "drivers/kv760_driver.h"

#include "drivers/kv760_input.h"
#include "drivers/read_back.h"
#include "drivers/step_runner.h"
#include "drivers/user_cal_step.h"
#include "model/codec.h"
#include "model/register_values.h"

namespace kv {

namespace {

// Flag_C bit 7 is set while the module is being programmed.
constexpr int ProgrammingBit = 7;
// DrvBusID tells the two writes of Flag_C apart: the first is queued with 32.
constexpr qint16 FirstFlagCWrite = 32;
constexpr qint16 SecondFlagCWrite = 16;

DriverWork work760;

// --- hooks of the programming order ---

bool startOfRun(StepContext& step, QString& text) {
    KV760Input input;
    if (!KV760StartValues(step.settings, RegVal, input, text))
        return false;
    RegVal.Type_In_Unit = input.typeInUnit;
    RegVal.Flag_A = input.flagA;
    RegVal.Trig_Level = input.trigLevel;
    RegVal.Meas_Unit_Z = input.lowHz;
    RegVal.Meas_Unit_F = input.highHz;
    RegVal.Aux_C = input.auxCurrent;
    RegVal.Aux_V = input.auxVoltage;
    RegVal.Flag_C = qint16(SetBit(0, ProgrammingBit));
    step.work.DrvBusID = FirstFlagCWrite;
    return true;
}

bool firstFlagCWrite(const StepContext& step) {
    return step.work.DrvBusID == FirstFlagCWrite;
}

bool secondFlagCWrite(StepContext& step, QString& text) {
    if (step.work.DrvBusID == SecondFlagCWrite)
        return true;
    text = QStringLiteral(" Return ID") + QString::number(step.busId) + QStringLiteral(" Invalid");
    return false;
}

bool endProgramming(StepContext& step, QString&) {
    step.work.DrvBusID = SecondFlagCWrite;
    RegVal.Flag_C = qint16(ClearBit(quint16(RegVal.Flag_C), ProgrammingBit));
    return true;
}

// --- hook of the reading order ---

bool decodeRead(StepContext& step, QString&) {
    SettingsSet& s = step.settings;
    QString& warning = step.work.DrvWarning;
    ReadModuleIdentity(RegVal, s);
    s.Inp1EngZro = RegVal.Eng_In_Z;
    s.Inp1EngFul = RegVal.Eng_In_F;
    s.Inp1EngUnt = EngUnitText(RegVal);
    KV760ReadInput(RegVal, s, warning);

    if (!ReadUserRange(Output1Range, RegVal, s, warning))
        warning += QStringLiteral("Invalid Output 1 Range, ");
    ReadTable1(RegVal, s);
    return true;
}

using S = SettingsSet;
using W = DriverWork;
#define REG(member) KV_REG(member)

// clang-format off
const StepRow programOrder[] = {
    // acknowledged                    work                next request
    {On(REG(Mod_Type)),                startOfRun,         Write(REG(Flag_C), Computed(REG(Flag_C)))},
    {On(REG(Flag_C), firstFlagCWrite), nullptr,            FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)),  nullptr,            Write(REG(Eng_Unit1), CharOf(&S::Inp1EngUnt, 0))},
    {On(REG(Eng_Unit1)),               nullptr,            Write(REG(Eng_Unit2), CharOf(&S::Inp1EngUnt, 1))},
    {On(REG(Eng_Unit2)),               nullptr,            Write(REG(Eng_Unit3), CharOf(&S::Inp1EngUnt, 2))},
    {On(REG(Eng_Unit3)),               nullptr,            Write(REG(Eng_Unit4), CharOf(&S::Inp1EngUnt, 3))},
    {On(REG(Eng_Unit4)),               nullptr,            Write(REG(Eng_In_Z), Setting(&S::Inp1EngZro))},
    {On(REG(Eng_In_Z)),                nullptr,            Write(REG(Eng_In_F), Setting(&S::Inp1EngFul))},
    {On(REG(Eng_In_F)),                nullptr,            Write(REG(Meas_Unit_Z), Computed(REG(Meas_Unit_Z)))},  // Hz
    {On(REG(Meas_Unit_Z)),             nullptr,            Write(REG(Meas_Unit_F), Computed(REG(Meas_Unit_F)))},  // Hz
    {On(REG(Meas_Unit_F)),             nullptr,            Write(REG(Trig_Level), Computed(REG(Trig_Level)))},
    {On(REG(Trig_Level)),              nullptr,            Write(REG(Aux_C), Computed(REG(Aux_C)))},
    {On(REG(Aux_C)),                   nullptr,            Write(REG(Aux_V), Computed(REG(Aux_V)))},
    {On(REG(Aux_V)),                   Output1Calibration, Write(REG(Out_Rng1), Setting(&S::Out1RngTyp))},
    {On(REG(Out_Rng1)),                nullptr,            Write(REG(Usr_Out1_Z), Work(&W::DrvOutZ))},
    {On(REG(Usr_Out1_Z)),              nullptr,            Write(REG(Usr_Out1_F), Work(&W::DrvOutF))},
    {On(REG(Usr_Out1_F)),              Limit1Calibration,  Write(REG(Sig_Lmt1_Z), Work(&W::DrvOutZ))},
    {On(REG(Sig_Lmt1_Z)),              nullptr,            Write(REG(Sig_Lmt1_F), Work(&W::DrvOutF))},
    {On(REG(Sig_Lmt1_F)),              nullptr,            Write(REG(Flag_A), Computed(REG(Flag_A)))},
    {On(REG(Flag_A)),                  nullptr,            Write(REG(Type_In_Unit), Computed(REG(Type_In_Unit)))},
    {On(REG(Type_In_Unit)),            nullptr,            FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),        nullptr,            Read(REG(Int_Temp))},
    {On(REG(Int_Temp)),                nullptr,            Write(REG(Buss_ID), Setting(&S::BussIdenti))},
    {On(REG(Buss_ID)),                 endProgramming,     WriteData(REG(Flag_C), Computed(REG(Flag_C)))},
    {On(REG(Flag_C)),                  secondFlagCWrite,   Read(REG(Remote1))},
};

const StepRow readOrder[] = {
    {On(REG(Mod_Type)),               nullptr,    Read(REG(Buss_ID))},
    {On(REG(Buss_ID)),                nullptr,    FirstFileNamePart(REG(File_Name))},
    {OnFileNameParts(REG(File_Name)), nullptr,    Read(REG(TypInput))},
    {On(REG(TypInput)),               nullptr,    Read(REG(Meas_Unit_Z))},
    {On(REG(Meas_Unit_Z)),            nullptr,    Read(REG(Meas_Unit_F))},
    {On(REG(Meas_Unit_F)),            nullptr,    Read(REG(Eng_In_F))},
    {On(REG(Eng_In_F)),               nullptr,    Read(REG(Eng_In_Z))},
    {On(REG(Eng_In_Z)),               nullptr,    Read(REG(Eng_Unit1))},
    {On(REG(Eng_Unit1)),              nullptr,    Read(REG(Eng_Unit2))},
    {On(REG(Eng_Unit2)),              nullptr,    Read(REG(Eng_Unit3))},
    {On(REG(Eng_Unit3)),              nullptr,    Read(REG(Eng_Unit4))},
    {On(REG(Eng_Unit4)),              nullptr,    Read(REG(Flag_A))},
    {On(REG(Flag_A)),                 nullptr,    Read(REG(Type_In_Unit))},
    {On(REG(Type_In_Unit)),           nullptr,    Read(REG(Out_Rng1))},
    {On(REG(Out_Rng1)),               nullptr,    Read(REG(Usr_Out1_Z))},
    {On(REG(Usr_Out1_Z)),             nullptr,    Read(REG(Usr_Out1_F))},
    {On(REG(Usr_Out1_F)),             nullptr,    Read(REG(Sig_Lmt1_Z))},
    {On(REG(Sig_Lmt1_Z)),             nullptr,    Read(REG(Sig_Lmt1_F))},
    {On(REG(Sig_Lmt1_F)),             nullptr,    Read(REG(Trig_Level))},
    {On(REG(Trig_Level)),             nullptr,    Read(REG(Aux_C))},
    {On(REG(Aux_C)),                  nullptr,    Read(REG(Aux_V))},
    {On(REG(Aux_V)),                  nullptr,    FirstTablePart(REG(Table1))},
    {OnTableParts(REG(Table1)),       nullptr,    Read(REG(Remote1))},
    {On(REG(Remote1)),                decodeRead, Read(REG(Int_Temp))},
};
// clang-format on

const DriverDescriptor kv760{
    "modKV760v1",
    "GS760",
    Kv760Map,
    "modKV760.cbSet",
    "modKV760.cbGet",
    TableOf(programOrder),
    TableOf(readOrder),
    REG(Remote1),
    REG(Int_Temp),
    &work760,
    {"frmKV760", "Programmed", "", "", ""},
};

#undef REG

}  // namespace

const DriverDescriptor& Kv760Driver() {
    return kv760;
}

bool GS760(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings, qint32 id,
           qint16 busId, QString& text) {
    return Dispatch(kv760, engine, kind, requester, settings, id, busId, text);
}

}  // namespace kv
