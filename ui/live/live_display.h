#pragma once
// The live panel's computations: each takes the view as it stands and the
// records to read, and updates the texts and indicators of one part of it.

#include "ui/live/live_view.h"

#include <optional>

namespace kv {

// Highest good Input_Reading of a family: the first-version KV714/KV716 count
// up to 4090, the others to 10500 (105 % of span).
qint32 InputReadingLimit(int map);

// Lays the panels out for a family (ModuleMap); 0 or an unknown map leaves an
// inactive panel with "-" identity values. Empties every value, summary and
// error text.
void ShowModuleControls(LiveView& view, int map);

// The entry point after a register reply was stored at `address`: identity
// values, the response flag, and on Input_Reading the redraw of the family.
void KV700Display(LiveView& view, const LiveSource& source, qint32 address);

// Input range indicators: "Input Low" below 2, "Input Hi" above `limit`,
// otherwise the pulsing live indicator, advanced one phase.
void FlashInput(LiveView& view, qint32 reading, qint32 limit);

void KV720Display(LiveView& view, const LiveSource& source);
void KV760v1Display(LiveView& view, const LiveSource& source);
void KV718vA_Display(LiveView& view, const LiveSource& source);
void KV714KV716Display(LiveView& view, const LiveSource& source);

// Projects one output of a KV720, KV760 or KV718 from the reading (or from its
// remote register) through the output range row `range` and the user calibration.
void Output_KVv2(LiveView& view, const LiveSource& source, qint32 range, int channel, bool limitsOn,
                 bool reverse, bool remote);

// Input panel of a KV714/KV716; returns the input as a fraction of its
// calibrated span, or nothing when it cannot be computed.
std::optional<float> KV714KV716_Input_and_A(LiveView& view, const LiveSource& source);

// Projects one output of a KV714/KV716 from its switch setting and the input fraction.
void KV714KV716_Output(LiveView& view, const LiveSource& source, qint32 switchValue, int channel,
                       std::optional<float> fraction);

// Shows or hides a channel's remote controls; both limit indicators go off.
void ShowRemote(LiveView& view, int channel, bool show);

}  // namespace kv
