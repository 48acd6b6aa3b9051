#pragma once
// A model driver as data: its programming and reading orders are constant
// tables of steps, one row per acknowledged register, read by the shared step
// runner (drivers/step_runner.h). Adding a driver means a new file with its
// tables and hooks and one entry in the list of drivers (drivers/driver_list.h).

#include "model/register_map.h"
#include "model/settings_set.h"

#include <QString>

namespace kv {

class RequestEngine;
struct DriverDescriptor;

// The working values of one driver, shared by every window of its models; a
// new run overwrites them.
struct DriverWork {
    QString DrvRequester;  // tag of the window that started the run
    qint16 DrvBusID = 16;  // bus ID of the next request; the part of a multi-part register
    QString DrvWarning;    // collected while reading, handed over at the end
    float DrvInLo = 0.0f;  // input range at the module's amplifier, mV
    float DrvInHi = 0.0f;
    float DrvInOffset = 0.0f;  // mV added to the input before the range is chosen
    qint16 DrvInCh = 0;        // value for the input channel register
    qint16 DrvInRes = 0;       // value for the input impedance register
    qint32 DrvOutZ = 0;        // output counts computed just before they are written
    qint32 DrvOutF = 0;
    int DrvModel = 0;  // family the dispatcher was called for (drivers serving two models)
    int DrvStep = -1;  // row of the order taken last, for progress reports
};

// A register of a step row, by member; its address is looked up in RegAdd when the
// step runs, so no step ever holds a literal address.
#define KV_REG(member) ::kv::RegField(#member, &::kv::RegMap::member)

// Where the value of a write comes from.
struct ValueSource {
    enum Kind : quint8 {
        None,
        SettingLong,    // a 32-bit integer field of the settings record
        SettingSingle,  // a single field of the settings record (written as a single)
        WorkInt,        // a 16-bit working value
        WorkLong,       // a 32-bit working value
        Computed,       // a RegVal member the driver has just computed
        TextChar,       // the character code of one character of a text field
    };
    Kind kind = None;
    qint32 SettingsSet::*settingLong = nullptr;
    float SettingsSet::*settingSingle = nullptr;
    qint16 DriverWork::*workInt = nullptr;
    qint32 DriverWork::*workLong = nullptr;
    RegField computed;
    QString SettingsSet::*text = nullptr;
    int index = 0;
};

constexpr ValueSource Setting(qint32 SettingsSet::*field) {
    ValueSource v;
    v.kind = ValueSource::SettingLong;
    v.settingLong = field;
    return v;
}
constexpr ValueSource Setting(float SettingsSet::*field) {
    ValueSource v;
    v.kind = ValueSource::SettingSingle;
    v.settingSingle = field;
    return v;
}
constexpr ValueSource Work(qint16 DriverWork::*field) {
    ValueSource v;
    v.kind = ValueSource::WorkInt;
    v.workInt = field;
    return v;
}
constexpr ValueSource Work(qint32 DriverWork::*field) {
    ValueSource v;
    v.kind = ValueSource::WorkLong;
    v.workLong = field;
    return v;
}
constexpr ValueSource Computed(RegField member) {
    ValueSource v;
    v.kind = ValueSource::Computed;
    v.computed = member;
    return v;
}
// Character `index` (0-based) of a text field, blank beyond its end.
constexpr ValueSource CharOf(QString SettingsSet::*field, int index) {
    ValueSource v;
    v.kind = ValueSource::TextChar;
    v.text = field;
    v.index = index;
    return v;
}

// What a step hands to its hooks and conditions.
struct StepContext {
    const DriverDescriptor& driver;
    RequestEngine& engine;
    DriverWork& work;
    SettingsSet& settings;
    qint32 id;     // register just acknowledged
    qint16 busId;  // bus ID of the acknowledgement
    bool reading;  // a reading run (callback kind 1) rather than programming (2)
};

// A check or computation of a step; false ends the run with the reason in text.
using StepHook = bool (*)(StepContext& step, QString& text);
// Chooses between rows that acknowledge the same register.
using StepCondition = bool (*)(const StepContext& step);

// How a row recognises its acknowledgement.
enum class AckKind : quint8 {
    Register,       // one acknowledgement of the register
    FileNameParts,  // the parts of the file name; the row's request follows the last part
    TableParts,     // the parts of a table transfer; the row's request follows the last part
};

struct Acknowledgement {
    RegField reg;
    AckKind kind = AckKind::Register;
    StepCondition when = nullptr;  // nullptr: always
};

constexpr Acknowledgement On(RegField reg, StepCondition when = nullptr) {
    return {reg, AckKind::Register, when};
}
constexpr Acknowledgement OnFileNameParts(RegField reg) {
    return {reg, AckKind::FileNameParts, nullptr};
}
constexpr Acknowledgement OnTableParts(RegField reg) {
    return {reg, AckKind::TableParts, nullptr};
}

// The request a step queues.
enum class RequestKind : quint8 {
    Write,          // W_DelayCB: write, read back, call back
    WriteData,      // W_DataOK of one typed value with bus ID DrvBusID
    Read,           // R_CB with bus ID DrvBusID and the run's callback kind
    FirstFileName,  // first part (bus ID 16) of the file name: written or read
    FirstTable,     // first part of a table transfer: written ("T") or read
};

struct NextRequest {
    RequestKind kind = RequestKind::Read;
    RegField reg;
    ValueSource value;
};

constexpr NextRequest Write(RegField reg, ValueSource value) {
    return {RequestKind::Write, reg, value};
}
constexpr NextRequest WriteData(RegField reg, ValueSource value) {
    return {RequestKind::WriteData, reg, value};
}
constexpr NextRequest Read(RegField reg) {
    return {RequestKind::Read, reg, {}};
}
constexpr NextRequest FirstFileNamePart(RegField reg) {
    return {RequestKind::FirstFileName, reg, {}};
}
constexpr NextRequest FirstTablePart(RegField reg) {
    return {RequestKind::FirstTable, reg, {}};
}

// One row of an order: the register just acknowledged, the work done on it,
// the request queued next.
struct StepRow {
    Acknowledgement ack;
    StepHook hook = nullptr;
    NextRequest next;
};

struct StepTable {
    const StepRow* rows = nullptr;
    int count = 0;
    const StepRow* begin() const { return rows; }
    const StepRow* end() const { return rows + count; }
};

template <int N>
constexpr StepTable TableOf(const StepRow (&rows)[N]) {
    return {rows, N};
}

// How the settings window (and the command-line tool) runs a driver.
struct RunTexts {
    const char* window;      // "frmKV720": log tags window + ".cbSet" / ".cbGet"
    const char* programmed;  // status at the end of a programming run
    // For a window that serves several drivers and picks one by ModuleMap:
    // the failure texts when the map names none of them ("" for one driver).
    const char* unknownMapProgram;
    const char* unknownMapRead;
    const char* unknownMapWarning;  // the map changed before the warning was collected
};

struct DriverDescriptor {
    const char* module;       // "modKV720"
    const char* dispatcher;   // "GS720"
    int family;               // register map the driver serves; CheckModType asks for it
    const char* setTag;       // log tag of a failed programming step
    const char* getTag;       // log tag of a failed reading step
    StepTable programOrder;   // first row: acknowledgement of Mod_Type
    StepTable readOrder;      // first row: acknowledgement of Mod_Type
    RegField lastProgrammed;  // handled by the run, never by a step
    RegField lastRead;
    DriverWork* work;
    RunTexts run;
};

}  // namespace kv
