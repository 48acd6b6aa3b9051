#pragma once
// What a module settings window offers the main window: it is a tab, the
// engine calls it back by its tag, and it opens either from a loaded file or
// by reading the connected module.

#include "engine/callback_receiver.h"
#include "ui/common/tab_window.h"

namespace kv {

class SettingsWindow : public TabWindow, public CallbackReceiver {
    Q_OBJECT
public:
    using TabWindow::TabWindow;

    // Shows the settings loaded last from a file (RestoredSet) for register map `map`.
    virtual void Restore(int map) = 0;
    // Starts reading the connected module of register map `map` into the window.
    virtual void LoadDialouge(int map) = 0;
    // The minor-trim window hands back to the settings window that opened it;
    // only windows that offer the trim act on it.
    virtual void CheckMinorTrim() {}
};

}  // namespace kv
