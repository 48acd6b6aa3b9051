#pragma once
// Every window repaints itself when the user picks another colour theme.

namespace kv {

class ThemedWindow {
public:
    virtual ~ThemedWindow() = default;
    virtual void SetColour() = 0;
};

}  // namespace kv
