#pragma once
// A pseudo-terminal standing in for the serial device of the adapter.
// The program opens and closes its port for every exchange; the simulator keeps
// a descriptor of the slave open for its whole life so that the master side
// never sees a hang-up (EIO) between two exchanges.

#include <QString>

namespace kv::sim {

class PseudoTerminal {
public:
    PseudoTerminal() = default;
    ~PseudoTerminal() { close(); }
    PseudoTerminal(const PseudoTerminal&) = delete;
    PseudoTerminal& operator=(const PseudoTerminal&) = delete;

    bool open(QString& error);
    void close();

    int masterFd() const { return master_; }  // non-blocking
    QString slavePath() const { return slavePath_; }

private:
    int master_ = -1;
    int slave_ = -1;
    QString slavePath_;
};

}  // namespace kv::sim
