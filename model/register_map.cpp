#include "model/register_map.h"

#include <QtMath>

namespace kv {

RegMap RegAdd;
RegMap RegVal;
int ModuleMap = NoModuleMap;

double RegField::value(const RegMap& record) const {
    if (!isSet())
        return 0.0;
    switch (width_) {
    case RegWidth::Long:
        return record.*longMember_;
    case RegWidth::Int:
        return record.*intMember_;
    case RegWidth::Single:
        break;
    }
    return double(record.*singleMember_);
}

int RegField::address(const RegMap& addresses) const {
    if (!isSet())
        return -1;
    return width_ == RegWidth::Single ? qRound(addresses.*singleMember_) : int(value(addresses));
}

void RegField::setAddress(RegMap& addresses, int address) const {
    switch (width_) {
    case RegWidth::Long:
        addresses.*longMember_ = address;
        return;
    case RegWidth::Int:
        addresses.*intMember_ = qint16(address);
        return;
    case RegWidth::Single:
        addresses.*singleMember_ = float(address);
        return;
    }
}

namespace {

// The width letter is checked: a member of another width does not compile.
#define L(member) RegField(#member, static_cast<qint32 RegMap::*>(&RegMap::member))
#define I(member) RegField(#member, static_cast<qint16 RegMap::*>(&RegMap::member))
#define S(member) RegField(#member, static_cast<float RegMap::*>(&RegMap::member))

constexpr qint16 na = -1;

using R = RegRole;
constexpr RegAccess RW = RegAccess::Writable;
constexpr RegAccess RO = RegAccess::ReadOnly;
constexpr RegAccess Hidden = RegAccess::Hidden;

// Addresses per map, decimal. Maps: 1 KV714 v1, 2 KV716 v1, 3 KV720,
// 4 KV714 v2 and KV718-10/-20, 5 KV716 v2, 6 KV760, 7 KV718-1A/-2A.
// clang-format off
const RegisterRow registerTable[] = {
    // member              role         access  description                     1    2    3    4    5    6    7
    {L(Rng_First),         R::SpanLimit,  Hidden, "",                           {16,  16,  72,  16,  16,  20,  26}},
    {L(Rng_Last),          R::SpanLimit,  Hidden, "",                           {67,  75,  87,  67,  75,  35,  67}},
    {L(Lowest_Reg),        R::MapLimit,   Hidden, "Lowest Reg Add",             {68,  76,  16,  68,  76,  36,  68}},
    {L(Highest_Reg),       R::MapLimit,   Hidden, "Highest Reg Add",            {86, 102,  78,  98, 113,  79, 100}},
    {L(Serial_No),         R::Value,      RW,     "Serial number",              {76,  88,  50,  76,  88,  42,  76}},
    {L(Buss_ID),           R::Value,      RW,     "BUSS ID",                    {80,  93,  27,  80,  92,  64,  80}},
    {L(Int_Ref),           R::Value,      RO,     "Internal reference",         {68,  76,  69,  68,  76,  40,  68}},
    {L(Revision),          R::Value,      RO,     "Revision two bites",         {69,  77,  68,  69,  77,  41,  69}},
    {L(Input_Reading),     R::Reading16,  RO,     "Input Reading",              {82,  95,  20,  83, 102,  78,  83}},
    {L(Int_Temp),          R::Value,      RO,     "Internal temperature",       {83,  96,  21,  84,  96,  77,  84}},
    {L(Term_Temp),         R::Value,      RO,     "Terminal Temperature",       {na,  na,  22,  na,  na,  na,  na}},
    {L(CIN_Z),             R::Value,      RO,     "CIN_Z Cal  IN ZS",           {na,  na,  16,  na,  na,  na,  na}},
    {L(CIN_F),             R::Value,      RO,     "CIN_F Cal  IN FS",           {na,  na,  17,  na,  na,  na,  na}},
    {L(COUT_Z),            R::Value,      RO,     "COUT_Z CalOUT ZS",           {na,  na,  18,  na,  na,  na,  na}},
    {L(COUT_F),            R::Value,      RO,     "COUT_F CalOUT FS",           {na,  na,  19,  na,  na,  na,  na}},
    {L(Input_B4_Table),    R::Value,      Hidden, "Input Before Table",         {na,  na,  23,  82,  95,  na,  82}},
    {I(TypInput),          R::Value,      RW,     "TypInput / Tseries",         {na,  na,  28,  79,  94,  63,  79}},
    {I(in_ch),             R::Value,      RW,     "in_ch   Input Channel",      {na,  na,  30,  na,  na,  na,  na}},
    {I(in_res),            R::Value,      RW,     "in_res  Input impeadence",   {na,  na,  31,  na,  na,  na,  na}},
    {I(Flag_A),            R::Value,      RW,     "Control Flag A",             {na,  na,  33,  81,  93,  65,  81}},
    {I(Type_In_Unit),      R::Value,      RW,     "Type In Unit",               {na,  na,  34,  na,  na,  61,  na}},
    {I(Flag_C),            R::Value,      RW,     "Control Flag C",             {na,  na,  na,  na,  na,  79,  na}},
    {L(Eng_Unit1),         R::Value,      RW,     "Eng Unit First Digit CH1",   {na,  na,  37,  94, 110,  49,  94}},
    {L(Eng_Unit2),         R::Value,      RW,     "Eng Unit Second Digit",      {na,  na,  38,  95, 111,  50,  95}},
    {L(Eng_Unit3),         R::Value,      RW,     "Eng Unit Third  Digit",      {na,  na,  39,  96, 112,  51,  96}},
    {L(Eng_Unit4),         R::Value,      RW,     "Eng Unit Fourth Digit",      {na,  na,  40,  97, 113,  52,  97}},
    {L(Tare),              R::Value,      RW,     "Stored Tare Value",          {na,  na,  41,  na,  na,  na,  na}},
    {L(In_Rng1),           R::Value,      RW,     "MR Input 1 Range",           {77,  89,  29,  77,  89,  na,  77}},
    {L(Usr_In1_Z),         R::Value,      RW,     "Mz User Input 1 Zero",       {70,  78,  42,  70,  78,  na,  70}},
    {L(Usr_In1_F),         R::Value,      RW,     "Mf User Input 1 Full Scale", {71,  79,  43,  71,  79,  na,  71}},
    {L(Out_Rng1),          R::Value,      RW,     "User Output 1 Range",        {78,  90,  32,  78,  90,  62,  78}},
    {L(Usr_Out1_Z),        R::Value,      RW,     "User Output 1 Zero",         {72,  80,  44,  72,  80,  57,  72}},
    {L(Usr_Out1_F),        R::Value,      RW,     "User Output 1 Full Scale",   {73,  81,  45,  73,  81,  58,  73}},
    {L(Sig_Lmt1_Z),        R::Value,      RW,     "Signal Limit 1 Lo",          {75,  82,  48,  75,  82,  60,  75}},
    {L(Sig_Lmt1_F),        R::Value,      RW,     "Signal Limit 1 Hi",          {74,  83,  47,  74,  83,  59,  74}},
    {L(ST_Samples),        R::Value,      RW,     "ST Measure samples",         {na,  na,  na,  na,  na,  na,  99}},
    {L(MIZ),               R::Value,      RW,     "MIZ Offset Cal",             {na,  na,  na,  na,  na,  na, 100}},
    {S(Eng_In_Z),          R::Value,      RW,     "A Eng Input Z 1",            {na,  na,  51,  90, 106,  43,  90}},
    {S(Eng_In_F),          R::Value,      RW,     "B Eng Input FS 1",           {na,  na,  52,  91, 107,  44,  91}},
    {S(Meas_Unit_Z),       R::Value,      RW,     "C Measure Unit Z 1",         {na,  na,  53,  92, 108,  47,  92}},
    {S(Meas_Unit_F),       R::Value,      RW,     "D Measure Unit FS 1",        {na,  na,  54,  93, 109,  48,  93}},
    {L(Trig_Level),        R::Value,      RW,     "Trigger Level",              {na,  na,  na,  na,  na,  56,  na}},
    {L(Aux_C),             R::Value,      RW,     "Aux C calculated",           {na,  na,  46,  na,  na,  54,  na}},
    {L(Aux_V),             R::Value,      RW,     "Aux V calculated",           {na,  na,  na,  na,  na,  55,  na}},
    {S(In_Freq),           R::PulseValue, RW,     "Input frequency",            {na,  na,  na,  na,  na,  71,  na}},
    {S(Pulse_Valley),      R::PulseValue, RW,     "Pulse valley",               {na,  na,  na,  na,  na,  72,  na}},
    {S(Pulse_Peak),        R::PulseValue, RW,     "Pulse peak",                 {na,  na,  na,  na,  na,  73,  na}},
    {S(Pulse_Valley_Raw),  R::PulseValue, RW,     "Pulse vally before correction", {na, na, na, na, na, 74,  na}},
    {S(Pulse_Peak_Raw),    R::PulseValue, RW,     "Pulse peak before correction",  {na, na, na, na, na, 75,  na}},
    {S(Trig_Level_RT),     R::PulseValue, RW,     "Trigger level real time",    {na,  na,  na,  na,  na,  76,  na}},
    {L(SLOP_P),            R::Value,      RW,     "SLOP_P Positive Offset Slop", {na, na,  57,  na,  na,  na,  na}},
    {L(SLOP_N),            R::Value,      RW,     "SLOP_N Negative Offset Slop", {na, na,  58,  na,  na,  na,  na}},
    {L(PtoN),              R::Value,      RW,     "PtoN   Positive to Negative", {na, na,  59,  na,  na,  na,  na}},
    {L(OS_PT100),          R::Value,      RW,     "OS_PT100 PT100 offset",      {na,  na,  60,  na,  na,  na,  na}},
    {L(OS_PT1K),           R::Value,      RW,     "OS_PT1K  PT1K offset",       {na,  na,  61,  na,  na,  na,  na}},
    {L(IS_ZS1),            R::Value,      RW,     "IS_ZS1 Current Source ZS1",  {na,  na,  62,  na,  na,  36,  na}},
    {L(IS_FS1),            R::Value,      RW,     "IS_FS1 Current Source FS1",  {na,  na,  63,  na,  na,  37,  na}},
    {L(IS_ZS2),            R::Value,      RW,     "IS_ZS2 Current Source ZS2",  {na,  na,  64,  na,  na,  na,  na}},
    {L(IS_FS2),            R::Value,      RW,     "IS_FS2 Current Source FS2",  {na,  na,  65,  na,  na,  na,  na}},
    {L(VS_ZS1),            R::Value,      RW,     "VS_ZS1 Voltage Source ZS1",  {na,  na,  66,  na,  na,  38,  na}},
    {L(VS_FS1),            R::Value,      RW,     "VS_FS1 Voltage Source FS1",  {na,  na,  67,  na,  na,  39,  na}},
    {L(VS_ZS2),            R::Value,      RW,     "VS_ZS2 Voltage Source ZS2",  {na,  na,  70,  na,  na,  na,  na}},
    {L(VS_FS2),            R::Value,      RW,     "VS_FS2 Voltage Source FS2",  {na,  na,  71,  na,  na,  na,  na}},
    {L(In_Rng2),           R::Value,      RW,     "MR Input 2 Range",           {na,  na,  na,  na,  na,  na,  na}},
    {L(Usr_In2_Z),         R::Value,      RW,     "User Input 2 Zero",          {na,  na,  na,  na,  na,  na,  na}},
    {L(Usr_In2_F),         R::Value,      RW,     "User Input 2 Full Scale",    {na,  na,  na,  na,  na,  na,  na}},
    {L(Out_Rng2),          R::Value,      RW,     "User Output 2 Range",        {na,  91,  na,  na,  91,  na,  na}},
    {L(Usr_Out2_Z),        R::Value,      RW,     "User Output 2 Zero",         {na,  84,  na,  na,  84,  na,  na}},
    {L(Usr_Out2_F),        R::Value,      RW,     "User Output 2 Full Scale",   {na,  85,  na,  na,  85,  na,  na}},
    {L(Sig_Lmt2_Z),        R::Value,      RW,     "Signal Limit 2 Lo",          {na,  86,  na,  na,  86,  na,  na}},
    {L(Sig_Lmt2_F),        R::Value,      RW,     "Signal Limit 2 Hi",          {na,  87,  na,  na,  87,  na,  na}},
    {L(Resp1),             R::Value,      RW,     "Responce time flag 1",       {79,  92,  na,  na,  na,  na,  na}},
    {L(Resp2),             R::Value,      RW,     "Responce time flag 2",       {na,  na,  na,  na,  na,  na,  na}},
    {L(Sig_Lmt_On),        R::Value,      RW,     "User Signal Limits ON/OFF",  {81,  94,  na,  na,  na,  na,  na}},
    {L(Sw_In1),            R::Value,      RO,     "Input  1 Switch Setting",    {84,  97,  na,  85,  97,  na,  85}},
    {L(Sw_Out1),           R::Value,      RO,     "Output 1 Switch Setting",    {85,  98,  na,  86,  98,  na,  86}},
    {L(Sw_In2),            R::Value,      RO,     "Input  2 Switch Setting",    {na,  na,  na,  na,  na,  na,  na}},
    {L(Sw_Out2),           R::Value,      RO,     "Output 2 Switch Setting",    {na,  99,  na,  na,  99,  na,  na}},
    {L(Remote1),           R::Value,      RW,     "Remote Output 1",            {86, 100,  24,  87, 100,  69,  87}},
    {L(Remote2),           R::Value,      RW,     "Remote Output 2",            {na, 101,  na,  na, 101,  na,  na}},
    {L(IO_Dir),            R::Value,      RW,     "Input/Output direction",     {na, 102,  na,  na,  na,  na,  na}},
    {L(Minor_Cal),         R::Value,      RW,     "Minor Cal Control",          {na,  na,  25,  na,  na,  na,  na}},
    {L(Orig_FlagA),        R::Value,      RW,     "Original FlagA Value",       {na,  na,  26,  na,  na,  na,  na}},
    {L(Gain_Factor),       R::Value,      RW,     "Gain Factor",                {na,  na,  74,  na,  na,  na,  na}},  // inside the range span
    {L(Orig_OS_PWM),       R::Value,      RW,     "Original OS_PWM Value",      {na,  na,  78,  na,  na,  na,  na}},  // inside the range span
    {L(Mod_Type),          R::Value,      RO,     "Module Type",                {255, 255, 255, 127, 127, 127, 127}},
    {L(Com_Power),         R::Value,      RW,     "Communication Power",        {254, 254, 254, 126, 126, 126, 126}},
    {L(Table1),            R::TablePart,  RW,     "Table 1 -",                  {na,  na,  49,  88, 103,  68,  88}},
    {L(TableC),            R::TablePart,  RW,     "Table C -",                  {na,  na,  36,  na,  na,  na,  na}},
    {L(File_Name),         R::FileNamePart, RW,   "File Name -",                {na,  na,  35,  98, 105,  66,  98}},
    {L(Cal_Errors),        R::ErrorBytes, Hidden, "Calibration Errors",         {na,  na,  55,  89, 104,  67,  89}},
};
// clang-format on

#undef L
#undef I
#undef S

}  // namespace

const RegisterRow* RegisterRows::begin() const {
    return std::begin(registerTable);
}

const RegisterRow* RegisterRows::end() const {
    return std::end(registerTable);
}

RegisterRows AllRegisters() {
    return {};
}

RegMap RegMapFor(int map) {
    RegMap addresses;
    if (map < 1 || map > MapCount)
        return addresses;
    for (const RegisterRow& row : AllRegisters())
        row.field.setAddress(addresses, row.addressIn(map));
    return addresses;
}

const RegisterRow* FindRegister(const RegMap& addresses, int address) {
    if (address < 0)
        return nullptr;
    for (const RegisterRow& row : AllRegisters())
        if (row.isRegister() && row.field.address(addresses) == address)
            return &row;
    return nullptr;
}

void SetRegMap(RegMap& addresses, int map) {
    static const RegMap notDefined;
    addresses.Com_Power = notDefined.Com_Power;
    addresses.Mod_Type = notDefined.Mod_Type;
    if (map == NoModuleMap) {
        addresses = notDefined;
        RegVal = notDefined;
        return;
    }
    if (map < 1 || map > MapCount)
        return;
    for (const RegisterRow& row : AllRegisters())
        row.field.setAddress(addresses, row.addressIn(map));
}

}  // namespace kv
