#pragma once
// The complete configuration of one module as the user sees it: engineering
// values, units and choices. One record type serves every model.

#include <QString>
#include <array>

namespace kv {

constexpr int Table1Points = 102;  // points 0..101
constexpr int TableCPoints = 53;   // points 0..52
constexpr int FileNameLength = 20;

struct SettingsSet {
    qint32 ModTypeSet = 0;
    qint32 SerialNumb = 0;
    qint32 BussIdenti = 0;
    qint32 SoftwarRev = 0;
    qint32 UserLmtEna = 0;
    qint32 DirecrReve = 0;
    qint32 RemoteCont = 0;
    qint32 MinorTrim = 0;
    qint32 Inp1RngTyp = 0;
    qint32 Typ1Differ = 0;
    qint32 Inp1RngSet = 0;
    qint32 Typ1InRes = 0;
    qint32 Typ1InUnit = 0;
    float Inp1EngZro = 0;
    float Inp1EngFul = 0;
    QString Inp1EngUnt;
    float Inp1mU_Zro = 0;
    float Inp1mU_Ful = 0;
    qint32 TrigMode = 0;
    float TrigLevel = 0;
    qint32 Inp1Respon = 0;
    qint32 Inp1Samples = 0;
    qint32 Inp1BurnOut = 0;
    QString Inp1Shape;
    QString Inp1MeUnit;
    qint32 Out1RngTyp = 0;
    float Out1EngZro = 0;
    float Out1EngFul = 0;
    QString Out1EngUnt;
    float Out1SigLmZ = 0;
    float Out1SigLmF = 0;
    qint32 Out2RngTyp = 0;
    float Out2EngZro = 0;
    float Out2EngFul = 0;
    QString Out2EngUnt;
    float Out2SigLmZ = 0;
    float Out2SigLmF = 0;
    std::array<qint32, Table1Points> Table1{};
    std::array<qint32, TableCPoints> TableC{};
    float AuxVmA = 0;
    qint32 AuxIsI = 0;
    float AuxImA = 0;
    QString FileName;  // always FileNameLength characters once set through SetFileName
    QString LoadNote;  // built by the last file load; never written to files

    // Pads with blanks or cuts to exactly FileNameLength characters.
    void SetFileName(const QString& name);
};

// The record most recently loaded from a file.
SettingsSet& RestoredSet();

}  // namespace kv
