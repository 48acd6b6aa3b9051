#pragma once
// What the program takes from its command line and shows in its title.

#include <QString>
#include <QStringList>

namespace kv {

struct CommandLine {
    bool debug = false;
    QString fileToOpen;  // as given; empty when none
    bool demo = false;
    QString demoModel;  // empty: the simulator's default module
};

// `arguments` without the program name. The shell has usually removed the
// quotes (a launcher that passes them on is unquoted here), so the first argument that is neither
// an option nor the word "Debug" names the file. "--demo" may be followed by a model ("--demo
// KV720-20" or
// "--demo=KV720-20"); a following argument with a "/" or "." is a file instead.
CommandLine ParseCommandLine(const QStringList& arguments);

// The debug rule: the command line is longer than 4 characters and contains
// "Debug" in exactly that case.
bool DebugRequested(const QString& commandLine);

// "KV700 PC Programmer " + major "00" + minor "00" + revision " r0", from a
// "major.minor.revision" version.
QString ProgramCaption(const QString& version);

}  // namespace kv
