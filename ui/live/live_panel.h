#pragma once
// The live panel of the main window: the connected module's identity, its
// measured input and the projected value of each output, with the remote
// controls of an output under remote control. It redraws itself from the
// register records whenever the engine stores a reply, and lays itself out
// anew whenever the module family changes.

#include "ui/common/colour_palette.h"
#include "ui/live/live_view.h"

#include <QFrame>
#include <array>

class QLabel;
class QLineEdit;
class QPushButton;

namespace kv {

class ModuleConnection;
class IndicatorLamp;

class LivePanel : public QFrame {
    Q_OBJECT
public:
    // Follows the connection's engine (registerStored) and module changes
    // (moduleControlsChanged) by itself.
    explicit LivePanel(ModuleConnection& connection, QWidget* parent = nullptr);

    // Redraw after a register reply was stored at `address`.
    void KV700Display(qint32 address);
    // Panels for a family (ModuleMap); 0 or an unknown family greys the panel.
    void ShowModuleControls(int map);
    void SetColour(const ColourPalette& colours);

    const LiveView& view() const { return view_; }
    QLineEdit* txtRemoteSet(int channel) const;
    QPushButton* cmdRemote(int channel) const;
    bool remoteRefused(int channel) const;
    // Sends the value typed for an output under remote control.
    void cmdRemote_Click(int channel);

private:
    struct InputWidgets {
        QFrame* picInput = nullptr;
        QLabel* labInput = nullptr;
        QLabel* labInputValue = nullptr;
        QLabel* labCusValInput = nullptr;
        QLabel* labInputError = nullptr;
        QLabel* labResponce1 = nullptr;
        IndicatorLamp* inLo = nullptr;
        IndicatorLamp* inHi = nullptr;
    };
    struct OutputWidgets {
        QFrame* picOutput = nullptr;
        QLabel* labOutput = nullptr;
        QLabel* labOutputValue = nullptr;
        QLabel* labCusValOutput = nullptr;
        QLabel* labOutputError = nullptr;
        IndicatorLamp* outLo = nullptr;
        IndicatorLamp* outHi = nullptr;
        QWidget* remoteRow = nullptr;
        QLineEdit* txtRemoteSet = nullptr;
        QPushButton* cmdRemote = nullptr;
        bool refused = false;
    };

    QFrame* buildInput();
    QFrame* buildOutput(int channel);
    QFrame* buildIdentity();
    void render();
    void applyStyle();
    void setRemoteRefused(int channel, bool refused);

    ModuleConnection& connection_;
    LiveView view_;
    ColourPalette colours_ = PaletteFor(ThemeWhiteGreen);
    InputWidgets input_;
    std::array<OutputWidgets, 2> outputs_;
    std::array<QLabel*, 4> labValue_{};
    QLabel* labAboutOutputs_ = nullptr;
};

}  // namespace kv
