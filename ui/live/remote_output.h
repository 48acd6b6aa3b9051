#pragma once
// Remote forcing of an output: the value typed for channel i in the output's
// engineering units becomes the count written to Remote1 or Remote2.

#include "ui/live/live_view.h"

#include <QString>

namespace kv {

struct RemoteRequest {
    bool accepted = false;
    qint32 address = -1;  // RegAdd.Remote1 or RegAdd.Remote2
    qint32 count = 0;     // the value to write
    QString refusal;      // status message when not accepted
    // Set when the output range itself is unusable: the output panel then
    // shows this summary and "?? " until the next redraw.
    bool outputUnusable = false;
    QString outputSummary;
};

// Checks the typed text against the output's range and converts it to the
// module's remote scale: 0.01 % of the calibrated span on a KV720 or KV760, an
// output count of the range row on a first-version KV714/KV716.
RemoteRequest RemoteOutputRequest(const LiveSource& source, int channel, const QString& text);

// The output panel after a refusal that names an unusable output range.
void ShowRemoteRefusal(LiveView& view, const RemoteRequest& request);

}  // namespace kv
