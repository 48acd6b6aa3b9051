#pragma once
// What the live panel of the main window shows, as plain data: label texts,
// indicator states and which panels and remote controls are visible. The
// computations that fill it read only the register records and range tables;
// the panel widget just displays the result.

#include "model/range_table.h"
#include "model/register_map.h"

#include <QString>
#include <array>

namespace kv {

// The records a redraw reads: by default the program-wide ones.
struct LiveSource {
    const RegMap& add;
    const RegMap& val;
    int map;
    const RangeTable& input1;
    const RangeTable& output1;
    const RangeTable& output2;

    static LiveSource Program();
    const RangeTable& outputTable(int channel) const { return channel == 0 ? output1 : output2; }
};

// An indicator: hidden, lit in the alarm colour, or (input low only) pulsing
// to show that readings arrive.
enum class Lamp { Off, Alarm, Pulse };

struct InputView {
    QString heading;
    QString value;          // labInputValue(0)
    QString summary;        // labCusValInput(0), lines separated by CRLF
    QString error;          // labInputError(0)
    QString response;       // labResponce1
    Lamp low = Lamp::Off;   // inLo(0)
    Lamp high = Lamp::Off;  // inHi(0)
    int pulseColour = 0;    // colour index of the pulse while low is Pulse
};

struct OutputView {
    bool visible = false;
    QString heading;
    QString value;    // labOutputValue(i)
    QString summary;  // labCusValOutput(i)
    QString error;    // labOutputError(i)
    Lamp low = Lamp::Off;
    Lamp high = Lamp::Off;
    bool remote = false;  // cmdRemote(i) and txtRemoteSet(i) shown
};

struct IdentityView {
    QString serial;       // labValue(1)
    QString revision;     // labValue(2)
    QString busId;        // labValue(3)
    QString temperature;  // labValue(4)
};

struct LiveView {
    int map = NoModuleMap;
    bool active = false;  // false: the panels take the theme's inactive colour
    InputView input;
    std::array<OutputView, 2> outputs;
    IdentityView identity;
    qint16 phase = 0;  // pulse phase counter of the live indicator, 0..7
};

struct Rgb {
    int red;
    int green;
    int blue;
};
constexpr int PulseColours = 5;
// The pulse colours, dark to bright; phases 5..7 run back through 3..1.
Rgb PulseColour(int index);

}  // namespace kv
