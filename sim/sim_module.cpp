#include "sim/sim_module.h"

#include <cmath>
#include <cstring>

namespace kv::sim {

namespace {
// The address every module answers its type code at, whatever its family.
const int universalTypeAddress = RegMap().Mod_Type;

// Every multi-part register numbers its parts from the same bus ID.
constexpr int FirstPart = Table1Ids.first;
static_assert(FirstPart == TableCIds.first && FirstPart == FileNameIds.first &&
              FirstPart == CalErrorIds.first);

constexpr qint32 FullScale = 10000;    // Input_Reading: 0.01 % of the calibrated span
constexpr double ReadingPeriodS = 60;  // one sweep up and down through the range
constexpr double SweepMargin = 0.02;   // the sweep runs this far past both ends

// Minor trim: codes written to Minor_Cal and the verdicts left in it.
constexpr qint32 TrimZero = 10;
constexpr qint32 TrimSpan = 100;
constexpr qint32 TrimIdle = 0;
constexpr qint32 TrimDone = 0;
constexpr qint32 TrimUnknown = 1;
constexpr qint32 TrimOutOfRange = 200;
constexpr qint32 TrimWindow = 500;  // the input may be 5 % of span off the trimmed end

// Live measurements.
constexpr qint32 InternalTemp = 31;  // degrees C, drifting by one either way
constexpr qint32 TerminalTemp = 24;
constexpr double TempPeriodS = 120;
constexpr int HighPulseType = 7;            // the KV760 input type for 8 V to 200 V pulses
constexpr double HighPulseFactor = 0.0068;  // its input divider
constexpr double PulseValleyV = 0.12;
constexpr double PulsePeakV = 5.8;
constexpr double HighPulseValleyV = 0.5;
constexpr double HighPulsePeakV = 24;
constexpr double RawPulseFactor = 1.03;  // the readings before the module's correction
constexpr double TriggerCountsPerV = 9930;

qint32 singleBits(double value) {
    const float single = float(value);
    quint32 bits;
    std::memcpy(&bits, &single, sizeof bits);
    return qint32(bits);
}

float bitsSingle(qint32 bits) {
    float single;
    std::memcpy(&single, &bits, sizeof single);
    return single;
}

int addressOf(float address) {
    return int(std::lround(address));
}

bool isPart(const PartIds& ids, int busId) {
    return busId >= ids.first && busId <= ids.last && (busId - ids.first) % ids.step == 0;
}

QByteArray byteText(const QByteArray& bytes) {
    QByteArray text;
    for (char c : bytes)
        text += NibbleText(quint8(c), 2);
    return text;
}

quint32 nibbles(const QByteArray& text) {
    quint32 value = 0;
    NibbleValue(text, value);
    return value;
}
}  // namespace

SimModule::SimModule(const ModuleIdentity& identity)
    : identity_(identity), family_(FamilyOfType(identity.typeCode)), map_(RegMapFor(family_)),
      image_(FactoryState(identity)), born_(std::chrono::steady_clock::now()) {}

std::unique_ptr<SimModule> SimModule::replacedBy(const ModuleIdentity& identity) const {
    auto module = std::make_unique<SimModule>(identity);
    module->trimVerdict_ = trimVerdict_;
    module->heldReading_ = heldReading_;
    return module;
}

SimModule::Part SimModule::partAt(int address) const {
    const RegisterRow* row = FindRegister(map_, address);
    if (!row)
        return Part::None;
    switch (row->role) {
    case RegRole::TablePart:
        return row->field.is(&RegMap::Table1) ? Part::Table1 : Part::TableC;
    case RegRole::FileNamePart:
        return Part::FileName;
    case RegRole::ErrorBytes:
        return Part::CalErrors;
    default:
        return Part::None;
    }
}

bool SimModule::isLive(int address) const {
    const int live[] = {universalTypeAddress,
                        map_.Mod_Type,
                        map_.Input_Reading,
                        map_.Input_B4_Table,
                        map_.Int_Temp,
                        map_.Term_Temp,
                        addressOf(map_.In_Freq),
                        addressOf(map_.Pulse_Valley),
                        addressOf(map_.Pulse_Peak),
                        addressOf(map_.Pulse_Valley_Raw),
                        addressOf(map_.Pulse_Peak_Raw),
                        addressOf(map_.Trig_Level_RT)};
    for (int liveAddress : live)
        if (address == liveAddress)
            return true;
    return false;
}

bool SimModule::isReadOnly(int address) const {
    if (isLive(address))
        return true;
    const RegisterRow* row = FindRegister(map_, address);
    return row && row->access == RegAccess::ReadOnly;
}

bool SimModule::isSixteenBit(int address) const {
    const RegisterRow* row = FindRegister(map_, address);
    return row && row->field.width() == RegWidth::Int;
}

double SimModule::seconds() const {
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - born_).count();
}

qint32 SimModule::reading() const {
    if (heldReading_)
        return *heldReading_;
    const double phase = std::fmod(seconds(), ReadingPeriodS) / ReadingPeriodS;
    const double sweep = phase < 0.5 ? 2 * phase : 2 - 2 * phase;
    double zero = 0;
    double full = FullScale;
    if (family_ == 1 || family_ == 2) {
        // First-version modules report raw counts against their user calibration.
        zero = reg(map_.Usr_In1_Z);
        full = reg(map_.Usr_In1_F);
    }
    const double margin = SweepMargin * (full - zero);
    return qint32(std::lround(zero - margin + sweep * (full - zero + 2 * margin)));
}

qint32 SimModule::liveValue(int address) const {
    if (address == universalTypeAddress || address == map_.Mod_Type)
        return identity_.typeCode;
    if (address == map_.Input_Reading || address == map_.Input_B4_Table)
        return reading();
    const double drift = std::sin(2 * M_PI * seconds() / TempPeriodS);
    if (address == map_.Int_Temp)
        return InternalTemp + qint32(std::lround(drift));
    if (address == map_.Term_Temp)
        return TerminalTemp + qint32(std::lround(drift));

    const qint32 flags = reg(map_.Flag_A);
    if (address == addressOf(map_.Trig_Level_RT)) {
        const int band = (flags & 3) == 3 ? 10 : (flags & 1) ? 5 : 1;
        return singleBits(reg(map_.Trig_Level) / TriggerCountsPerV / band);
    }
    if (address == addressOf(map_.In_Freq)) {
        const double low = bitsSingle(reg(addressOf(map_.Meas_Unit_Z)));
        const double high = bitsSingle(reg(addressOf(map_.Meas_Unit_F)));
        return singleBits(low + (high - low) * std::max(0, reading()) / FullScale);
    }
    const bool highPulses = ((reg(map_.Type_In_Unit) >> 4) & 7) == HighPulseType;
    const double valley = highPulses ? HighPulseValleyV * HighPulseFactor : PulseValleyV;
    const double peak = highPulses ? HighPulsePeakV * HighPulseFactor : PulsePeakV;
    if (address == addressOf(map_.Pulse_Valley))
        return singleBits(valley);
    if (address == addressOf(map_.Pulse_Peak))
        return singleBits(peak);
    if (address == addressOf(map_.Pulse_Valley_Raw))
        return singleBits(valley * RawPulseFactor);
    return singleBits(peak * RawPulseFactor);
}

qint32 SimModule::value(int address) const {
    if (address < 0 || address >= RegisterCount)
        return 0;
    const Part part = partAt(address);
    if (part != Part::None)
        return qint32(nibbles(readPart(part, FirstPart).data));
    if (isLive(address))
        return liveValue(address);
    return image_.registers[address];
}

void SimModule::setValue(int address, qint32 value) {
    if (address < 0 || address >= RegisterCount)
        return;
    image_.registers[address] = isSixteenBit(address) ? qint16(value) : value;
}

void SimModule::setCalErrors(const std::vector<int>& errors) {
    for (std::size_t i = 0; i < image_.calErrors.size(); ++i)
        image_.calErrors[i] = i < errors.size() ? errors[i] : 0;
}

SimModule::Answer SimModule::handle(const Request& request) {
    const Part part = partAt(request.address);
    if (part != Part::None)
        return request.command == 'R' ? readPart(part, request.busId)
                                      : writePart(part, request.busId, request.data);
    Answer answer;
    if (request.command == 'W') {
        const qint32 written = qint32(nibbles(request.data));
        if (request.address == map_.Minor_Cal) {
            trim(written);
        } else if (isReadOnly(request.address)) {
            answer.status = StatusReadOnly;
        } else {
            setValue(request.address, written);
        }
    }
    answer.data = NibbleText(quint32(value(request.address)), DataSize);
    return answer;
}

SimModule::Answer SimModule::readPart(Part part, int busId) const {
    Answer answer;
    const int k = busId - FirstPart;
    switch (part) {
    case Part::FileName:
        if (isPart(FileNameIds, busId))
            answer.data = byteText(image_.fileName.mid(k, 4));
        break;
    case Part::Table1:
    case Part::TableC: {
        const std::vector<qint32>& points = part == Part::Table1 ? image_.table1 : image_.tableC;
        if (k >= 0 && k + 1 < int(points.size()))
            answer.data = NibbleText(quint32(points[k]), 4) + NibbleText(quint32(points[k + 1]), 4);
        break;
    }
    case Part::CalErrors:
        if (isPart(CalErrorIds, busId)) {
            QByteArray bytes;
            for (int i = k; i < k + 4; ++i)
                bytes += char(image_.calErrors[i] & 0xFF);
            answer.data = byteText(bytes);
        }
        break;
    case Part::None:
        break;
    }
    if (answer.data.isEmpty()) {
        answer.data = NibbleText(0, DataSize);
        answer.status = StatusNoSuchPart;
    }
    return answer;
}

SimModule::Answer SimModule::writePart(Part part, int busId, const QByteArray& data) {
    const int k = busId - FirstPart;
    switch (part) {
    case Part::FileName:
        if (!isPart(FileNameIds, busId))
            break;
        for (int i = 0; i < 4; ++i)
            image_.fileName[k + i] = char(nibbles(data.mid(2 * i, 2)));
        break;
    case Part::Table1:
    case Part::TableC: {
        std::vector<qint32>& points = part == Part::Table1 ? image_.table1 : image_.tableC;
        if (k < 0 || k + 1 >= int(points.size()))
            break;
        points[k] = qint32(nibbles(data.left(4)));
        points[k + 1] = qint32(nibbles(data.mid(4, 4)));
        break;
    }
    case Part::CalErrors: {
        Answer answer = readPart(part, busId);
        if (answer.status == StatusDone)
            answer.status = StatusReadOnly;
        return answer;
    }
    case Part::None:
        break;
    }
    return readPart(part, busId);
}

void SimModule::trim(qint32 code) {
    if (code != TrimZero && code != TrimSpan) {
        setReg(map_.Minor_Cal, code == TrimIdle ? TrimIdle : TrimUnknown);
        return;
    }
    const qint32 now = reading();
    const qint32 target = code == TrimZero ? 0 : FullScale;
    const bool inWindow = std::abs(now - target) <= TrimWindow;
    const qint32 verdict = trimVerdict_ ? *trimVerdict_ : inWindow ? TrimDone : TrimOutOfRange;
    setReg(map_.Minor_Cal, verdict);
    if (verdict != TrimDone)
        return;
    if (code == TrimZero) {
        // Move the zero so that the input present now reads as zero.
        const qint32 zero = reg(map_.Usr_In1_Z);
        const qint32 span = reg(map_.Usr_In1_F) - zero;
        setReg(map_.Usr_In1_Z, zero + qint32(std::lround(double(now) * span / FullScale)));
    } else if (now > 0) {
        setReg(map_.Gain_Factor,
               qint32(std::lround(double(reg(map_.Gain_Factor)) * FullScale / now)));
    }
}

qint32 SimModule::reg(int address) const {
    return address >= 0 && address < RegisterCount ? image_.registers[address] : 0;
}

void SimModule::setReg(int address, qint32 value) {
    if (address >= 0 && address < RegisterCount)
        image_.registers[address] = value;
}

}  // namespace kv::sim
