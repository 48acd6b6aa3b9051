#pragma once
// The register map of every module family: one record type with a member per
// named register, and one table that gives each member's address in each map.
// RegAdd holds the connected module's addresses, RegVal the last value read
// from each of them.

#include "model/settings_set.h"

#include <QString>
#include <array>

namespace kv {

struct RegMap {
    qint32 Rng_First = -1;
    qint32 Rng_Last = -1;
    qint32 Lowest_Reg = -1;
    qint32 Highest_Reg = -1;
    qint32 Serial_No = -1;
    qint32 Buss_ID = -1;
    qint32 Int_Ref = -1;
    qint32 Revision = -1;
    qint32 Input_Reading = -1;
    qint32 Int_Temp = -1;
    qint32 Term_Temp = -1;
    qint32 CIN_Z = -1;
    qint32 CIN_F = -1;
    qint32 COUT_Z = -1;
    qint32 COUT_F = -1;
    qint32 Input_B4_Table = -1;
    qint16 TypInput = -1;
    qint16 in_ch = -1;
    qint16 in_res = -1;
    qint16 Flag_A = -1;
    qint16 Type_In_Unit = -1;
    qint16 Flag_C = -1;
    qint32 Eng_Unit1 = -1;
    qint32 Eng_Unit2 = -1;
    qint32 Eng_Unit3 = -1;
    qint32 Eng_Unit4 = -1;
    qint32 Tare = -1;
    qint32 In_Rng1 = -1;
    qint32 Usr_In1_Z = -1;
    qint32 Usr_In1_F = -1;
    qint32 Out_Rng1 = -1;
    qint32 Usr_Out1_Z = -1;
    qint32 Usr_Out1_F = -1;
    qint32 Sig_Lmt1_Z = -1;
    qint32 Sig_Lmt1_F = -1;
    qint32 ST_Samples = -1;
    qint32 MIZ = -1;
    float Eng_In_Z = -1.0f;
    float Eng_In_F = -1.0f;
    float Meas_Unit_Z = -1.0f;
    float Meas_Unit_F = -1.0f;
    qint32 Trig_Level = -1;
    qint32 Aux_C = -1;
    qint32 Aux_V = -1;
    float In_Freq = -1.0f;
    float Pulse_Valley = -1.0f;
    float Pulse_Peak = -1.0f;
    float Pulse_Valley_Raw = -1.0f;
    float Pulse_Peak_Raw = -1.0f;
    float Trig_Level_RT = -1.0f;
    qint32 SLOP_P = -1;
    qint32 SLOP_N = -1;
    qint32 PtoN = -1;
    qint32 OS_PT100 = -1;
    qint32 OS_PT1K = -1;
    qint32 IS_ZS1 = -1;
    qint32 IS_FS1 = -1;
    qint32 IS_ZS2 = -1;
    qint32 IS_FS2 = -1;
    qint32 VS_ZS1 = -1;
    qint32 VS_FS1 = -1;
    qint32 VS_ZS2 = -1;
    qint32 VS_FS2 = -1;
    qint32 In_Rng2 = -1;
    qint32 Usr_In2_Z = -1;
    qint32 Usr_In2_F = -1;
    qint32 Out_Rng2 = -1;
    qint32 Usr_Out2_Z = -1;
    qint32 Usr_Out2_F = -1;
    qint32 Sig_Lmt2_Z = -1;
    qint32 Sig_Lmt2_F = -1;
    qint32 Resp1 = -1;
    qint32 Resp2 = -1;
    qint32 Sig_Lmt_On = -1;
    qint32 Sw_In1 = -1;
    qint32 Sw_Out1 = -1;
    qint32 Sw_In2 = -1;
    qint32 Sw_Out2 = -1;
    qint32 Remote1 = -1;
    qint32 Remote2 = -1;
    qint32 IO_Dir = -1;
    qint32 Minor_Cal = -1;
    qint32 Orig_FlagA = -1;
    qint32 Gain_Factor = -1;
    qint32 Orig_OS_PWM = -1;
    qint32 Mod_Type = 255;  // the address every module answers before its family is known
    qint32 Com_Power = 254;
    qint32 Table1 = -1;  // in RegVal: bus ID of the last part received
    qint32 TableC = -1;
    std::array<qint32, Table1Points> Table1_Pts = filled<Table1Points>(-1);
    std::array<qint32, TableCPoints> TableC_Pts = filled<TableCPoints>(-1);
    qint32 File_Name = -1;
    QString File_Text;  // the module's 20-character file name, assembled part by part
    qint32 Cal_Errors = -1;

private:
    template <int N>
    static std::array<qint32, N> filled(qint32 value) {
        std::array<qint32, N> points;
        points.fill(value);
        return points;
    }
};

constexpr int MapCount = 7;  // register maps 1..7
// Register maps: one per module family.
enum ModuleMapNumber {
    NoModuleMap = 0,
    Kv714v1Map = 1,
    Kv716v1Map = 2,
    Kv720Map = 3,
    Kv714v2Map = 4,  // also the KV718 "-10"/"-20"
    Kv716v2Map = 5,
    Kv760Map = 6,
    Kv718AMap = 7,
    UnknownModuleMap = 99,
};

enum class RegWidth : quint8 { Long, Int, Single };

// One member of RegMap, by name and width. An S member holds its address as a
// floating number; address() rounds it. A default-built field names no member
// (an optional register in a driver's step row).
class RegField {
public:
    constexpr RegField() = default;
    constexpr RegField(const char* name, qint32 RegMap::*member)
        : RegField(name, RegWidth::Long, member, nullptr, nullptr) {}
    constexpr RegField(const char* name, qint16 RegMap::*member)
        : RegField(name, RegWidth::Int, nullptr, member, nullptr) {}
    constexpr RegField(const char* name, float RegMap::*member)
        : RegField(name, RegWidth::Single, nullptr, nullptr, member) {}
    constexpr const char* name() const { return name_; }
    constexpr RegWidth width() const { return width_; }
    constexpr bool is(qint32 RegMap::*member) const { return longMember_ == member; }
    constexpr bool is(qint16 RegMap::*member) const { return intMember_ == member; }
    constexpr bool is(float RegMap::*member) const { return singleMember_ == member; }
    constexpr bool isSet() const { return longMember_ || intMember_ || singleMember_; }
    constexpr bool isSingle() const { return singleMember_ != nullptr; }
    constexpr bool isSameAs(const RegField& other) const {
        return longMember_ == other.longMember_ && intMember_ == other.intMember_ &&
               singleMember_ == other.singleMember_;
    }

    // The member's value, exact for every width; 0 for no member.
    double value(const RegMap& record) const;
    // -1 for no member, or for one the map does not define.
    int address(const RegMap& addresses) const;
    void setAddress(RegMap& addresses, int address) const;

    void storeLong(RegMap& record, qint32 value) const { record.*longMember_ = value; }
    void storeInt(RegMap& record, qint16 value) const { record.*intMember_ = value; }
    void storeSingle(RegMap& record, float value) const { record.*singleMember_ = value; }

private:
    constexpr RegField(const char* name, RegWidth width, qint32 RegMap::*l, qint16 RegMap::*i,
                       float RegMap::*s)
        : name_(name), width_(width), longMember_(l), intMember_(i), singleMember_(s) {}

    const char* name_ = "";
    RegWidth width_ = RegWidth::Long;
    qint32 RegMap::*longMember_ = nullptr;
    qint16 RegMap::*intMember_ = nullptr;
    float RegMap::*singleMember_ = nullptr;
};

// How a row takes part in lookups by address.
enum class RegRole : quint8 {
    SpanLimit,     // first/last address of the range registers; no register of its own
    MapLimit,      // first/last address of the register image; loses to a register at its address
    Value,         // one register, one value
    Reading16,     // a value that travels as a 16-bit signed number
    PulseValue,    // a value named only on pulse-input modules (type code 9)
    TablePart,     // bus ID 16 + k carries table points k and k + 1
    FileNamePart,  // bus IDs 16, 20, .. 32 carry four characters each
    ErrorBytes,    // each bus ID carries four calibration error bytes
};

// What the register viewer may do with a register.
enum class RegAccess : quint8 {
    Writable,
    ReadOnly,
    Hidden,  // value shown as "??", not writable
};

struct RegisterRow {
    RegField field;
    RegRole role;
    RegAccess access;
    const char* description;               // "" for the span limits, which describe nothing
    std::array<qint16, MapCount> address;  // maps 1..7; -1 = not defined in that map

    int addressIn(int map) const { return map >= 1 && map <= MapCount ? address[map - 1] : -1; }
    bool isRegister() const { return role != RegRole::SpanLimit && role != RegRole::MapLimit; }
};

class RegisterRows {
public:
    const RegisterRow* begin() const;
    const RegisterRow* end() const;
    int size() const { return int(end() - begin()); }
};
// Every row of the address table, in the member order of RegMap.
RegisterRows AllRegisters();

// A map's addresses by value. Map 0 and unknown maps give every member -1
// except Mod_Type 255 and Com_Power 254.
RegMap RegMapFor(int map);

// The register (not a limit row) that sits at `address` in `addresses`, or nullptr.
const RegisterRow* FindRegister(const RegMap& addresses, int address);

// Multi-part registers: the bus IDs of their parts.
struct PartIds {
    int first;
    int last;
    int step;
};
constexpr PartIds Table1Ids{16, 16 + 100, 2};  // the last part carries point 100 and the checksum
constexpr PartIds TableCIds{16, 16 + 50, 2};
constexpr PartIds FileNameIds{16, 32, 4};
constexpr PartIds CalErrorIds{16, 96, 4};

extern RegMap RegAdd;
extern RegMap RegVal;
extern int ModuleMap;  // 1..7, NoModuleMap or UnknownModuleMap

// Fills an address record for a map. Map 0 also resets RegVal to the same
// not-defined record; maps outside 0..7 change only Mod_Type and Com_Power.
void SetRegMap(RegMap& addresses, int map);

}  // namespace kv
