#include "sim/sim_factory.h"

#include "model/register_map.h"

#include <cmath>
#include <cstring>
#include <limits>

namespace kv::sim {

namespace {
constexpr double na = std::numeric_limits<double>::quiet_NaN();

// How a family counts: every range register pair holds the count at the
// range's minimum (even register) and at its maximum (odd register). A family
// uses one converter for all its ranges, so all pairs share one scale; the
// KV720 holds one register per range instead of a pair.
struct FamilyScale {
    int family;
    qint32 low;
    qint32 high;
    bool pairs;
};

constexpr FamilyScale familyScales[] = {
    {1, 400, 3900, true},  // 12-bit first version: live readings stay below 4090
    {2, 400, 3900, true},   {3, 6000, 59000, false}, {4, 6000, 59000, true}, {5, 6000, 59000, true},
    {6, 6000, 59000, true}, {7, 32768, 60000, true},  // bipolar input: the range minimum sits at
                                                      // mid-scale
};

const FamilyScale* scaleOf(int family) {
    for (const FamilyScale& scale : familyScales)
        if (scale.family == family)
            return &scale;
    return nullptr;
}

enum ScaleEnd { Low, High };

struct ScaledRow {
    RegField field;
    ScaleEnd end;
};

struct FactoryRow {
    RegField field;
    std::array<double, MapCount> value;  // per family 1..7; na leaves the register 0
};

// The width letter is checked: a member of another width does not compile.
#define L(member) RegField(#member, static_cast<qint32 RegMap::*>(&RegMap::member))
#define I(member) RegField(#member, static_cast<qint16 RegMap::*>(&RegMap::member))
#define S(member) RegField(#member, static_cast<float RegMap::*>(&RegMap::member))

// User calibration spanning the whole of the selected ranges.
const ScaledRow userCountRows[] = {
    {L(Usr_In1_Z), Low},  {L(Usr_In1_F), High},  {L(Usr_Out1_Z), Low}, {L(Usr_Out1_F), High},
    {L(Sig_Lmt1_Z), Low}, {L(Sig_Lmt1_F), High}, {L(Usr_Out2_Z), Low}, {L(Usr_Out2_F), High},
    {L(Sig_Lmt2_Z), Low}, {L(Sig_Lmt2_F), High},
};

// Values written after the user counts; a member the family's map lacks is skipped.
// clang-format off
const FactoryRow factoryRows[] = {
    // member             1      2      3      4      5      6      7
    {L(Int_Ref),        {2500,  2500,  2500,  2500,  2500,  2500,  2500}},  // reference, mV
    {L(In_Rng1),        {4,     3,     4,     4,     3,     na,    10}},    // 4-20 mA; KV720 0-20 mV; KV718 0-10 V
    {L(Out_Rng1),       {4,     3,     3,     4,     3,     3,     4}},     // 4-20 mA; KV720, KV760 0-20 mA
    {L(Out_Rng2),       {na,    8,     na,    na,    8,     na,    na}},    // 0-10 V
    {L(Sw_In1),         {15,    15,    na,    15,    15,    na,    15}},    // switches in the software position
    {L(Sw_Out1),        {15,    15,    na,    15,    15,    na,    15}},
    {L(Sw_Out2),        {na,    15,    na,    na,    15,    na,    na}},
    {I(Flag_A),         {na,    na,    1,     0,     0,     0,     0}},     // KV720: negative offset direction
    {I(Type_In_Unit),   {na,    na,    0x11,  na,    na,    0x10,  na}},    // mV linear; KV760 input type 1, Hz
    {I(in_ch),          {na,    na,    3,     na,    na,    na,    na}},
    {I(in_res),         {na,    na,    1,     na,    na,    na,    na}},
    {L(Eng_Unit1),      {'%',   '%',   '%',   '%',   '%',   '%',   '%'}},
    {L(Eng_Unit2),      {' ',   ' ',   ' ',   ' ',   ' ',   ' ',   ' '}},
    {L(Eng_Unit3),      {' ',   ' ',   ' ',   ' ',   ' ',   ' ',   ' '}},
    {L(Eng_Unit4),      {' ',   ' ',   ' ',   ' ',   ' ',   ' ',   ' '}},
    {S(Eng_In_Z),       {0,     0,     0,     0,     0,     0,     0}},
    {S(Eng_In_F),       {100,   100,   100,   100,   100,   100,   100}},
    {S(Meas_Unit_Z),    {4,     4,     0,     4,     4,     0,     0}},
    {S(Meas_Unit_F),    {20,    20,    20,    20,    20,    1000,  10}},    // mA, mV, Hz, V
    {L(ST_Samples),     {na,    na,    na,    na,    na,    na,    1}},
    {L(Trig_Level),     {na,    na,    na,    na,    na,    9930,  na}},    // 1 V, least sensitive band
    // KV720 factory calibration; G = CIN_F - CIN_Z counts over a range's full span
    {L(CIN_Z),          {na,    na,    1200,  na,    na,    na,    na}},
    {L(CIN_F),          {na,    na,    58000, na,    na,    na,    na}},
    {L(COUT_Z),         {na,    na,    3000,  na,    na,    na,    na}},
    {L(COUT_F),         {na,    na,    59000, na,    na,    na,    na}},
    {L(SLOP_P),         {na,    na,    30000, na,    na,    na,    na}},
    {L(SLOP_N),         {na,    na,    30000, na,    na,    na,    na}},
    {L(PtoN),           {na,    na,    150,   na,    na,    na,    na}},
    {L(OS_PT100),       {na,    na,    200,   na,    na,    na,    na}},
    {L(OS_PT1K),        {na,    na,    200,   na,    na,    na,    na}},
    // Excitation sources: counts at the ends of each band
    {L(IS_ZS1),         {na,    na,    2000,  na,    na,    1800,  na}},
    {L(IS_FS1),         {na,    na,    60000, na,    na,    61000, na}},
    {L(IS_ZS2),         {na,    na,    2100,  na,    na,    na,    na}},
    {L(IS_FS2),         {na,    na,    61000, na,    na,    na,    na}},
    {L(VS_ZS1),         {na,    na,    1900,  na,    na,    1700,  na}},
    {L(VS_FS1),         {na,    na,    59000, na,    na,    60500, na}},
    {L(VS_ZS2),         {na,    na,    2000,  na,    na,    na,    na}},
    {L(VS_FS2),         {na,    na,    60000, na,    na,    na,    na}},
    {L(Aux_C),          {na,    na,    2000,  na,    na,    1800,  na}},
    {L(Aux_V),          {na,    na,    na,    na,    na,    1700,  na}},
    // KV720 user calibration of 0-20 mV in, 4-20 mA out, as its driver computes it
    {L(Usr_In1_Z),      {na,    na,    200,   na,    na,    na,    na}},
    {L(Usr_In1_F),      {na,    na,    58000, na,    na,    na,    na}},
    {L(Usr_Out1_Z),     {na,    na,    14200, na,    na,    na,    na}},
    {L(Usr_Out1_F),     {na,    na,    59000, na,    na,    na,    na}},
    {L(Sig_Lmt1_Z),     {na,    na,    3000,  na,    na,    na,    na}},
    {L(Sig_Lmt1_F),     {na,    na,    59000, na,    na,    na,    na}},
    {L(Orig_OS_PWM),    {na,    na,    200,   na,    na,    na,    na}},
    {L(Orig_FlagA),     {na,    na,    1,     na,    na,    na,    na}},
    {L(Gain_Factor),    {na,    na,    10000, na,    na,    na,    na}},
};

// Calibration error bytes left by the production bench: a few test points off.
struct ErrorRow {
    int index;
    int error;
};
const ErrorRow calErrorRows[] = {{3, 1}, {10, -1}, {27, 2}, {41, -3}, {60, 1}};
// clang-format on

#undef L
#undef I
#undef S

constexpr int CalErrorCount = 84;
constexpr int TableCStep = 40;  // counts per degree of the factory's table C

// A module's own small deviation of one calibration count, stable per serial number.
qint32 deviation(qint32 serial, int address) {
    return qint32((quint32(serial) * 2654435761u + quint32(address) * 40503u) % 41u) - 20;
}

void put(FactoryImage& image, const RegMap& map, const RegField& field, double value) {
    const int address = field.address(map);
    if (address < 0 || address >= RegisterCount || std::isnan(value))
        return;
    if (field.width() == RegWidth::Single) {
        const float single = float(value);
        quint32 bits;
        std::memcpy(&bits, &single, sizeof bits);
        image.registers[address] = qint32(bits);
    } else {
        image.registers[address] = qint32(value);
    }
}

void fillRanges(FactoryImage& image, const RegMap& map, const FamilyScale& scale, qint32 serial) {
    if (map.Rng_First < 0)
        return;
    for (int address = map.Rng_First; address <= map.Rng_Last; ++address) {
        const bool low = scale.pairs && address % 2 == 0;
        image.registers[address] = (low ? scale.low : scale.high) + deviation(serial, address);
    }
}

std::vector<qint32> linearTable(int points, int last, qint32 step) {
    std::vector<qint32> table(points, 0);
    for (int i = 0; i <= last; ++i)
        table[i] = i * step;
    table[last + 1] = TableCheck(table, last);
    return table;
}
}  // namespace

qint32 TableCheck(const std::vector<qint32>& points, int last) {
    quint32 x = 0;
    for (int i = 0; i <= last; ++i)
        x ^= quint32(points[i]);
    return qint32(~x & 0xFFFF);
}

FactoryImage FactoryState(const ModuleIdentity& identity) {
    FactoryImage image;
    const int family = FamilyOfType(identity.typeCode);
    const RegMap map = RegMapFor(family);
    if (const FamilyScale* scale = scaleOf(family)) {
        fillRanges(image, map, *scale, identity.serial);
        for (const ScaledRow& row : userCountRows)
            put(image, map, row.field, row.end == Low ? scale->low : scale->high);
        for (const FactoryRow& row : factoryRows)
            put(image, map, row.field, row.value[family - 1]);
    }
    put(image, map, RegField("Serial_No", &RegMap::Serial_No), identity.serial);
    put(image, map, RegField("Revision", &RegMap::Revision), identity.revision);
    put(image, map, RegField("Buss_ID", &RegMap::Buss_ID), identity.busId);
    put(image, map, RegField("TypInput", &RegMap::TypInput), identity.subType);

    image.fileName = QByteArray("FACTORY SETTINGS").leftJustified(FileNameLength, ' ');
    image.table1 = linearTable(Table1Points, Table1Points - 2, 100);
    image.tableC = linearTable(TableCPoints, TableCPoints - 3, TableCStep);
    image.calErrors.assign(CalErrorCount, 0);
    for (const ErrorRow& row : calErrorRows)
        image.calErrors[row.index] = row.error;
    return image;
}

}  // namespace kv::sim
