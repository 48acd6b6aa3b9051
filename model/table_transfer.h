#pragma once
// The parts of a linearisation table transfer. Each part carries two 16-bit
// points, and its bus ID names the part: bus ID 16 + k carries points k and k + 1
// for k = 0, 2, 4, ... up to the last used point, whose part also carries the
// checksum. Reading a table back uses the same bus IDs.

#include <QByteArray>
#include <QString>
#include <QVector>

namespace kv {

constexpr int FirstTableBusId = 16;

struct TableStep {
    int busId = 0;
    qint32 first = 0;   // point busId - 16
    qint32 second = 0;  // point busId - 15
    // The 8-character data field: the low 16 bits of each point as 4 nibble characters.
    QByteArray WireData() const;
};

// Every part of a table whose used points are 0..lastUsed (an even number); the
// points array holds at least lastUsed + 2 values.
QVector<TableStep> TableTransferSteps(const qint32* points, int lastUsed);
// Position of a bus ID among those parts, -1 when it names none.
int TableStepIndex(int busId, int lastUsed);

// A reply for another part than the one requested.
bool CheckTableReturnId(int sentId, int returnedId, bool writing, QString& message);
// A table read back: its checksum over points 0..lastUsed against its point lastUsed + 1.
bool CheckTableReadBack(const qint32* points, int lastUsed, QString& message);

}  // namespace kv
