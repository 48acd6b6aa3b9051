#pragma once
// Which module sits on the simulated adapter: model, serial number, revision,
// bus ID, and the register family that follows from its type code.

#include <QString>

namespace kv::sim {

struct ModuleIdentity {
    int typeCode = 4;  // the value of the "Module Type" register
    int subType = 1;   // TypInput: the variant, or a KV720's input type
    qint32 serial = 100001;
    qint32 revision = 0x0203;  // high byte major, low byte minor: 2.003
    qint32 busId = 1;
};

// Register family of a type code: 1..7, 0 for a code that no family answers to.
int FamilyOfType(int typeCode);

// Reads "KV720-20", "kv718-1a" or a type code with an optional sub-type, "7" or
// "7:5". Sets the type code and sub-type only; false for an unknown text.
bool ParseModel(const QString& text, ModuleIdentity& identity);

// The model text of a type code and sub-type, as the module reports itself.
QString ModelName(int typeCode, int subType);

// Every model text ParseModel knows, for --help and error messages.
QString KnownModels();

}  // namespace kv::sim
