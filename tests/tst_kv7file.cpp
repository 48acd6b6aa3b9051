#include "engine/diagnostics.h"
#include "files/file_locations.h"
#include "files/kv7_file.h"
#include "files/shell_open.h"

#include <QtTest>
#include <clocale>
#include <limits>

using namespace kv;

namespace {

// The single fields of a settings file in the order they are written.
const char* const ExpectedFieldKeys[] = {
    "ModTypeSet", "SerialNumb", "BussIdenti", "SoftwarRev", "FileName",    "UserLmtEna",
    "DirecrReve", "RemoteCont", "MinorTrim",  "Inp1RngTyp", "Typ1Differ",  "Inp1RngSet",
    "Typ1InRes",  "Typ1InUnit", "Inp1MeUnit", "Inp1Shape",  "Inp1BurnOut", "Inp1EngZro",
    "Inp1EngFul", "Inp1EngUnt", "Inp1mU_Zro", "Inp1mU_Ful", "Inp1Respon",  "Inp1Samples",
    "TrigMode",   "TrigLevel",  "Out1RngTyp", "Out1EngZro", "Out1EngFul",  "Out1EngUnt",
    "Out1SigLmZ", "Out1SigLmF", "Out2RngTyp", "Out2EngZro", "Out2EngFul",  "Out2EngUnt",
    "Out2SigLmZ", "Out2SigLmF", "AuxVmA",     "AuxIsI",     "AuxImA",
};

// Every field set to a value of its own, including floats that only survive
// a save in their shortest exact form.
SettingsSet fullRecord() {
    SettingsSet r;
    r.ModTypeSet = 4;
    r.SerialNumb = 1234567;
    r.BussIdenti = 255;
    r.SoftwarRev = 515;
    r.SetFileName(QStringLiteral("Pump 7 inlet"));
    r.UserLmtEna = 1;
    r.DirecrReve = 1;
    r.RemoteCont = 1;
    r.MinorTrim = 1;
    r.Inp1RngTyp = 2;
    r.Typ1Differ = 1;
    r.Inp1RngSet = 5;
    r.Typ1InRes = 1;
    r.Typ1InUnit = 35;
    r.Inp1MeUnit = QStringLiteral("mV");
    r.Inp1Shape = QStringLiteral("TYPE K");
    r.Inp1BurnOut = 2;
    r.Inp1EngZro = -200.5f;
    r.Inp1EngFul = 1372.f;
    r.Inp1EngUnt = QStringLiteral("\u00B0C");
    r.Inp1mU_Zro = -5.891f;
    r.Inp1mU_Ful = 54.886f;
    r.Inp1Respon = 1;
    r.Inp1Samples = 4000;
    r.TrigMode = 1;
    r.TrigLevel = 0.1f;
    r.Out1RngTyp = 13;
    r.Out1EngZro = 1.f / 3.f;
    r.Out1EngFul = 20.f;
    r.Out1EngUnt = QStringLiteral("mA");
    r.Out1SigLmZ = 3.8f;
    r.Out1SigLmF = 20.5f;
    r.Out2RngTyp = 9;
    r.Out2EngZro = 1e-7f;
    r.Out2EngFul = std::numeric_limits<float>::max();
    r.Out2EngUnt = QStringLiteral("V, DC");
    r.Out2SigLmZ = std::numeric_limits<float>::denorm_min();
    r.Out2SigLmF = -0.f;
    r.AuxVmA = 24.f;
    r.AuxIsI = 1;
    r.AuxImA = 0.25f;
    for (int i = 0; i < TableCPoints; ++i)
        r.TableC[i] = i * 1000 - 7;
    for (int i = 0; i < Table1Points; ++i)
        r.Table1[i] = i % 2 ? -i * 31 : i * 65536;
    return r;
}

class LogRecorder : public DiagnosticSink {
public:
    QStringList lines;
    void debugMessage(int, const QString& tag, const QString& text, const QByteArray&,
                      const QString&) override {
        lines << tag + QLatin1Char('|') + text;
    }
    void addMessage(const QString&) override {}
};

}  // namespace

class TestKv7File : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();
    void init();

    // writing
    void linesComeInTheFixedOrder();
    void writtenLines_data();
    void writtenLines();
    void extensionRule_data();
    void extensionRule();
    void saveCreatesMissingFolder();
    void saveRefusesTextsTheFormatCannotHold_data();
    void saveRefusesTextsTheFormatCannotHold();
    void saveRefusesNonFiniteNumbers();
    void failedSaveKeepsWhatWasThere();

    // reading
    void roundTripKeepsEveryField();
    void reorderedLinesLoadTheSameRecord();
    void laterLineWinsAndUnmentionedFieldsStay();
    void modTypeSetMissingOrZero_data();
    void modTypeSetMissingOrZero();
    void unknownKeysGoToTheLoadNote();
    void lenientForms();
    void textEncodings_data();
    void textEncodings();
    void malformedFiles_data();
    void malformedFiles();
    void fieldsReadBeforeAFailureStay();
    void unreadableFiles();
    void restoredSetAndCopy();

    // folders, names, launcher texts
    void defaultFolders();
    void proposedNames();
    void shellOpenMessages_data();
    void shellOpenMessages();

private:
    QString path(const QString& name) const { return dir->filePath(name); }
    QString writeRaw(const QString& name, const QByteArray& bytes) const;
    QByteArray saved(const SettingsSet& record);
    // Writes content as a file and loads it; name ends as RestoreKVdef leaves it.
    bool load(const QByteArray& content, SettingsSet& record, QString& name, qint32& type) const {
        name = writeRaw(QStringLiteral("load.kv7"), content);
        return RestoreKVdef(name, type, record);
    }

    std::unique_ptr<QTemporaryDir> dir;
};

void TestKv7File::initTestCase() {
    // A decimal-comma locale must not leak into files.
    QLocale::setDefault(QLocale(QLocale::German, QLocale::Germany));
    std::setlocale(LC_ALL, "de_DE.UTF-8");
}

void TestKv7File::init() {
    dir = std::make_unique<QTemporaryDir>();
    QVERIFY(dir->isValid());
}

QString TestKv7File::writeRaw(const QString& name, const QByteArray& bytes) const {
    QFile file(path(name));
    if (!file.open(QIODevice::WriteOnly) || file.write(bytes) != bytes.size())
        qFatal("cannot write test file");
    return file.fileName();
}

QByteArray TestKv7File::saved(const SettingsSet& record) {
    QString name = path(QStringLiteral("saved-%1.kv7").arg(QRandomGenerator::global()->generate()));
    if (!SaveKVdef(name, record))
        qFatal("save failed: %s", qPrintable(name));
    QFile file(name);
    file.open(QIODevice::ReadOnly);
    return file.readAll();
}

// --- writing ---------------------------------------------------------------

void TestKv7File::linesComeInTheFixedOrder() {
    const QByteArray bytes = saved(fullRecord());
    QVERIFY(bytes.endsWith("\r\n"));
    QCOMPARE(bytes.count("\r\n"), 196);
    QCOMPARE(bytes.count('\r') + bytes.count('\n'), 2 * 196);

    QStringList expected;
    for (const char* key : ExpectedFieldKeys)
        expected << QLatin1String(key);
    for (int i = 0; i <= 52; ++i)
        expected << QStringLiteral("TableC(%1)").arg(i, 3, 10, QLatin1Char('0'));
    for (int i = 0; i <= 101; ++i)
        expected << QStringLiteral("Table1(%1)").arg(i, 3, 10, QLatin1Char('0'));
    const QList<QByteArray> lines = bytes.chopped(1).split('\n');
    for (int i = 0; i < 196; ++i) {
        const QByteArray prefix = '"' + expected[i].toLatin1() + "\",";
        QVERIFY2(lines[i].startsWith(prefix), lines[i].constData());
    }
    QCOMPARE(lines[0], QByteArray("\"ModTypeSet\",4\r"));
    QCOMPARE(lines[4], QByteArray("\"FileName\",\"Pump 7 inlet        \"\r"));
    QCOMPARE(lines[195], QByteArray("\"Table1(101)\",-3131\r"));
}

void TestKv7File::writtenLines_data() {
    QTest::addColumn<QString>("key");
    QTest::addColumn<QVariant>("value");
    QTest::addColumn<QByteArray>("line");
    const auto row = [](const char* name, const char* key, const QVariant& value,
                        const QByteArray& line) { QTest::newRow(name) << key << value << line; };
    row("negative integer", "TableC(001)", -32768, "\"TableC(001)\",-32768\r\n");
    row("float with point", "Inp1EngZro", -1234.5f, "\"Inp1EngZro\",-1234.5\r\n");
    row("shortest float", "TrigLevel", 0.1f, "\"TrigLevel\",0.1\r\n");
    row("small float", "AuxImA", 1e-7f, "\"AuxImA\",1e-07\r\n");
    row("large float", "AuxVmA", 3e9f, "\"AuxVmA\",3e+09\r\n");
    row("text with comma", "Out2EngUnt", QStringLiteral("a, b"), "\"Out2EngUnt\",\"a, b\"\r\n");
    row("latin-1 text", "Inp1EngUnt", QStringLiteral("\u00B0C"),
        "\"Inp1EngUnt\",\"\xB0"
        "C\"\r\n");
}

void TestKv7File::writtenLines() {
    QFETCH(QString, key);
    QFETCH(QVariant, value);
    QFETCH(QByteArray, line);
    QByteArray out = "before\r\n";
    if (value.typeId() == QMetaType::Int)
        WF(out, key, qint32(value.toInt()));
    else if (value.typeId() == QMetaType::Float)
        WF(out, key, value.toFloat());
    else
        WF(out, key, value.toString());
    QCOMPARE(out, "before\r\n" + line);
}

void TestKv7File::extensionRule_data() {
    QTest::addColumn<QString>("given");
    QTest::addColumn<QString>("used");
    const auto row = [](const char* given, const char* used) {
        QTest::newRow(given) << given << used;
    };
    row("pump", "pump.kv7");
    row("pump.kv7", "pump.kv7");
    row("pump.Kv7", "pump.Kv7");
    row("pump.txt", "pump.txt.kv7");
    row("pump.kv", "pump.kv.kv7");
    row("pumpkv7", "pumpkv7.kv7");
}

void TestKv7File::extensionRule() {
    QFETCH(QString, given);
    QFETCH(QString, used);
    QString name = path(given);
    QVERIFY(SaveKVdef(name, fullRecord()));
    QCOMPARE(name, path(used));
    QVERIFY(QFileInfo::exists(path(used)));
    QCOMPARE(QDir(dir->path()).entryList(QDir::Files).size(), 1);

    QString loadName = path(given);
    qint32 type = 0;
    SettingsSet loaded;
    QVERIFY2(RestoreKVdef(loadName, type, loaded), qPrintable(loadName));
    QCOMPARE(loadName, path(used));
    QCOMPARE(type, 4);
}

void TestKv7File::saveCreatesMissingFolder() {
    QString name = path(QStringLiteral("new/deeper/pump"));
    QVERIFY2(SaveKVdef(name, fullRecord()), qPrintable(name));
    QVERIFY(QFileInfo(path(QStringLiteral("new/deeper/pump.kv7"))).isFile());
}

void TestKv7File::saveRefusesTextsTheFormatCannotHold_data() {
    QTest::addColumn<int>("field");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("message");
    const auto row = [](const char* name, int field, const QString& text, const char* message) {
        QTest::newRow(name) << field << text << message;
    };
    row("double quote", 0, "in\"ch", "Inp1EngUnt contains a double quote");
    row("line feed", 1, "two\nlines", "Inp1Shape contains a line break");
    row("carriage return", 2, "a\rb", "Out1EngUnt contains a line break");
    row("beyond latin-1", 3, "\u20AC/h", "Out2EngUnt contains the character");
    row("quote in file name", 4, "12\" pipe", "FileName contains a double quote");
}

void TestKv7File::saveRefusesTextsTheFormatCannotHold() {
    QFETCH(int, field);
    QFETCH(QString, text);
    QFETCH(QString, message);
    const QString old = writeRaw(QStringLiteral("pump.kv7"), "OLD CONTENT");
    SettingsSet record = fullRecord();
    QString SettingsSet::*const members[] = {&SettingsSet::Inp1EngUnt, &SettingsSet::Inp1Shape,
                                             &SettingsSet::Out1EngUnt, &SettingsSet::Out2EngUnt,
                                             &SettingsSet::FileName};
    record.*members[field] = text;
    QString name = old;
    QVERIFY(!SaveKVdef(name, record));
    QVERIFY2(name.startsWith(message), qPrintable(name));
    QFile file(old);
    QVERIFY(file.open(QIODevice::ReadOnly));
    QCOMPARE(file.readAll(), QByteArray("OLD CONTENT"));
}

void TestKv7File::saveRefusesNonFiniteNumbers() {
    SettingsSet record = fullRecord();
    record.Out1SigLmF = std::numeric_limits<float>::quiet_NaN();
    QString name = path(QStringLiteral("pump"));
    QVERIFY(!SaveKVdef(name, record));
    QCOMPARE(name, QStringLiteral("Out1SigLmF is not a finite number"));
    QVERIFY(!QFileInfo::exists(path(QStringLiteral("pump.kv7"))));
}

void TestKv7File::failedSaveKeepsWhatWasThere() {
    // A folder in the way of the file: the save fails and the folder survives.
    QVERIFY(QDir(dir->path()).mkpath(QStringLiteral("taken.kv7/inside")));
    QString name = path(QStringLiteral("taken.kv7"));
    QVERIFY(!SaveKVdef(name, fullRecord()));
    QVERIFY(name.endsWith(QLatin1Char(' ') + path(QStringLiteral("taken.kv7"))));
    QVERIFY(name.size() > path(QStringLiteral("taken.kv7")).size() + 1);
    QVERIFY(QFileInfo(path(QStringLiteral("taken.kv7/inside"))).isDir());

    // A file in the way of the folder.
    writeRaw(QStringLiteral("plain"), "x");
    name = path(QStringLiteral("plain/pump"));
    QVERIFY(!SaveKVdef(name, fullRecord()));
    QVERIFY2(name.startsWith(QStringLiteral("Cannot create the folder")), qPrintable(name));
    QVERIFY(QFileInfo(path(QStringLiteral("plain"))).isFile());
    QCOMPARE(QDir(dir->path()).entryList(QDir::Files | QDir::Hidden), QStringList{"plain"});
}

// --- reading ---------------------------------------------------------------

void TestKv7File::roundTripKeepsEveryField() {
    const SettingsSet original = fullRecord();
    QString name = path(QStringLiteral("pump"));
    QVERIFY(SaveKVdef(name, original));
    SettingsSet loaded;
    qint32 type = 0;
    QVERIFY2(RestoreKVdef(name, type, loaded), qPrintable(name));
    QCOMPARE(type, 4);
    QCOMPARE(loaded.FileName, QStringLiteral("Pump 7 inlet        "));
    QCOMPARE(loaded.Inp1EngUnt, QStringLiteral("\u00B0C"));
    QCOMPARE(loaded.Out2EngUnt, QStringLiteral("V, DC"));
    QCOMPARE(loaded.Out1EngZro, 1.f / 3.f);
    QCOMPARE(loaded.Out2EngFul, std::numeric_limits<float>::max());
    QCOMPARE(loaded.Out2SigLmZ, std::numeric_limits<float>::denorm_min());
    QVERIFY(std::signbit(loaded.Out2SigLmF));
    QCOMPARE(loaded.Table1, original.Table1);
    QCOMPARE(loaded.TableC, original.TableC);
    QCOMPARE(loaded.LoadNote, QStringLiteral(", ") + name);
    // Every other field: a record that saves to the same bytes holds the same values.
    QCOMPARE(saved(loaded), saved(original));
}

void TestKv7File::reorderedLinesLoadTheSameRecord() {
    const QByteArray bytes = saved(fullRecord());
    QList<QByteArray> lines = bytes.split('\n');
    lines.removeLast();
    std::reverse(lines.begin(), lines.end());
    std::rotate(lines.begin(), lines.begin() + 77, lines.end());
    SettingsSet loaded;
    QString name;
    qint32 type = 0;
    QVERIFY2(load(lines.join('\n') + '\n', loaded, name, type), qPrintable(name));
    QCOMPARE(saved(loaded), bytes);
}

void TestKv7File::laterLineWinsAndUnmentionedFieldsStay() {
    SettingsSet record;
    record.SerialNumb = 5;
    record.Inp1EngUnt = QStringLiteral("bar");
    record.Table1[7] = 99;
    QString name;
    qint32 type = 0;
    QVERIFY(load("\"ModTypeSet\",4\r\n\"Inp1EngUnt\",\"psi\"\r\n"
                 "\"Inp1EngUnt\",\"kPa\"\r\n\"ModTypeSet\",7\r\n",
                 record, name, type));
    QCOMPARE(type, 7);
    QCOMPARE(record.ModTypeSet, 7);
    QCOMPARE(record.Inp1EngUnt, QStringLiteral("kPa"));
    QCOMPARE(record.SerialNumb, 5);
    QCOMPARE(record.Table1[7], 99);
}

void TestKv7File::modTypeSetMissingOrZero_data() {
    QTest::addColumn<QByteArray>("content");
    QTest::newRow("zero") << QByteArray("\"ModTypeSet\",0\r\n\"SerialNumb\",12\r\n");
    QTest::newRow("missing") << QByteArray("\"SerialNumb\",12\r\n");
    QTest::newRow("zeroed by a later line")
        << QByteArray("\"ModTypeSet\",4\r\n\"ModTypeSet\",0\r\n");
    QTest::newRow("empty file") << QByteArray();
}

void TestKv7File::modTypeSetMissingOrZero() {
    QFETCH(QByteArray, content);
    QString name;
    qint32 type = 99;
    SettingsSet record;
    QVERIFY(!load(content, record, name, type));
    QCOMPARE(name, QStringLiteral("ModTypeSet not found ") + path(QStringLiteral("load.kv7")));
    QCOMPARE(type, 0);
}

void TestKv7File::unknownKeysGoToTheLoadNote() {
    LogRecorder log;
    DiagnosticSink* previous = SetDiagnosticSink(&log);
    QString name;
    qint32 type = 0;
    SettingsSet record;
    record.LoadNote = QStringLiteral("from an earlier load");
    const bool ok = load("\"ModTypeSet\",4\r\n\"Colour\",\"red\"\r\n\"Gain\",0.50\r\n"
                         "\"modtypeset\",9\r\n\"Label\",\"" +
                             QByteArray(90, 'z') + "\"\r\n",
                         record, name, type);
    SetDiagnosticSink(previous);
    QVERIFY(ok);
    QCOMPARE(type, 4);
    QCOMPARE(record.LoadNote, QStringLiteral(", Colour: red, Gain: 0.5, modtypeset: 9, Label: ") +
                                  QString(70, u'z') + QStringLiteral(", ") + name);
    QVERIFY(log.lines.contains(QStringLiteral("RestoreKVdef|Colour:red")));
    QVERIFY(log.lines.contains(QStringLiteral("RestoreKVdef|Gain:0.5")));
}

void TestKv7File::lenientForms() {
    // Hand-edited files: LF endings, blank lines, blanks, missing or extra quotes,
    // numbers in other forms, table points without leading zeros.
    SettingsSet r;
    QString name;
    qint32 type = 0;
    QVERIFY2(load("ModTypeSet, 4\n"
                  "\n"
                  "  \"SerialNumb\" , \"12\"\n"
                  "\"BussIdenti\",2.5\n"
                  "\"SoftwarRev\",3.5\n"
                  "\"UserLmtEna\",-2.5\n"
                  "\"Inp1EngZro\",.5\n"
                  "\"Inp1EngFul\",+1.5E3\n"
                  "\"TrigLevel\",5.\n"
                  "\"AuxImA\",1e-50\n"
                  "\"Inp1MeUnit\", ohm \n"
                  "\"Inp1Shape\",\" Linear \"\n"
                  "\"TableC(003)\",7e2\r"
                  "\"Table1(5)\",44\r"
                  "\"FileName\",\"Tank\"\r\n",
                  r, name, type),
             qPrintable(name));
    QCOMPARE(type, 4);
    QCOMPARE(r.SerialNumb, 12);
    QCOMPARE(r.BussIdenti, 2);  // halves go to the even neighbour
    QCOMPARE(r.SoftwarRev, 4);
    QCOMPARE(r.UserLmtEna, -2);
    QCOMPARE(r.Inp1EngZro, 0.5f);
    QCOMPARE(r.Inp1EngFul, 1500.f);
    QCOMPARE(r.TrigLevel, 5.f);
    QCOMPARE(r.AuxImA, 0.f);
    QCOMPARE(r.Inp1MeUnit, QStringLiteral("ohm"));
    QCOMPARE(r.Inp1Shape, QStringLiteral(" Linear "));
    QCOMPARE(r.TableC[3], 700);
    QCOMPARE(r.Table1[5], 44);
    QCOMPARE(r.FileName, QStringLiteral("Tank                "));
}

void TestKv7File::textEncodings_data() {
    QTest::addColumn<QByteArray>("content");
    QTest::newRow("latin-1") << QByteArray("\"ModTypeSet\",4\r\n\"Inp1EngUnt\",\"\xB0"
                                           "C\"\r\n");
    QTest::newRow("utf-8") << QByteArray("\"ModTypeSet\",4\r\n\"Inp1EngUnt\",\"\xC2\xB0"
                                         "C\"\r\n");
    QTest::newRow("bom") << QByteArray("\xEF\xBB\xBF\"ModTypeSet\",4\r\n\"Inp1EngUnt\",\"\xB0"
                                       "C\"\r\n");
}

void TestKv7File::textEncodings() {
    QFETCH(QByteArray, content);
    QString name;
    qint32 type = 0;
    SettingsSet r;
    QVERIFY2(load(content, r, name, type), qPrintable(name));
    QCOMPARE(r.Inp1EngUnt, QStringLiteral("\u00B0C"));
}

void TestKv7File::malformedFiles_data() {
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("reason");
    const auto row = [](const char* name, const QByteArray& lines, const QString& reason) {
        QTest::newRow(name) << "\"ModTypeSet\",4\r\n" + lines << reason;
    };
    const QByteArray binary("\x00\x01\xff\xfe\x80garbage\x00\x7f", 14);
    QTest::newRow("binary bytes") << binary + "\r\n\"ModTypeSet\",4\r\n"
                                  << "Line 1: " + QString::fromLatin1(binary) + " has no value";
    row("very long line", "\"Inp1EngUnt\",\"" + QByteArray(5000, 'x') + "\"\r\n",
        "Line 2: too long (more than 4096 characters)");
    row("missing closing quote", "\"Inp1EngUnt\",\"mA\r\n", "Line 2: a closing quote is missing");
    row("missing quote of key", "\"Inp1EngUnt,\"mA\"\r\n", "Line 2: text follows a closing quote");
    row("key without value", "\"SerialNumb\"\r\n\"BussIdenti\",1\r\n",
        "Line 2: SerialNumb has no value");
    row("decimal comma", "\"Inp1EngZro\",1,5\r\n", "Line 2: Inp1EngZro has more than one value");
    row("float not a number", "\"Inp1EngZro\",abc\r\n",
        "Line 2: value \"abc\" of Inp1EngZro is not a number");
    row("float nan", "\"TrigLevel\",nan\r\n", "Line 2: value \"nan\" of TrigLevel is not a number");
    row("float too large", "\"TrigLevel\",1e40\r\n",
        "Line 2: value \"1e40\" of TrigLevel is too large for a 32-bit floating value");
    row("integer not a number", "\"SerialNumb\",\"12a\"\r\n",
        "Line 2: value \"12a\" of SerialNumb is not a number");
    row("integer empty", "\"SerialNumb\",\r\n", "Line 2: value \"\" of SerialNumb is not a number");
    row("integer too large", "\"SerialNumb\",2147483648\r\n",
        "Line 2: value \"2147483648\" of SerialNumb does not fit a 32-bit integer");
    row("TableC(053)", "\"TableC(053)\",1\r\n",
        "Line 2: TableC(053) names point 53, outside 0 to 52");
    row("Table1(102)", "\"Table1(102)\",1\r\n",
        "Line 2: Table1(102) names point 102, outside 0 to 101");
    row("negative point", "\"TableC(-1)\",1\r\n",
        "Line 2: TableC(-1) names point -1, outside 0 to 52");
    row("point not a number", "\"TableC(abc)\",1\r\n", "Line 2: TableC(abc) names no table point");
}

void TestKv7File::malformedFiles() {
    QFETCH(QByteArray, content);
    QFETCH(QString, reason);
    QString name;
    qint32 type = 0;
    SettingsSet record;
    QVERIFY(!load(content, record, name, type));
    QVERIFY2(name.startsWith(reason), qPrintable(name));
    QVERIFY2(name.endsWith(QLatin1Char(' ') + path(QStringLiteral("load.kv7"))), qPrintable(name));
}

void TestKv7File::fieldsReadBeforeAFailureStay() {
    QString name;
    qint32 type = 0;
    SettingsSet record;
    record.BussIdenti = 1;
    QVERIFY(!load("\"ModTypeSet\",4\r\n\"SerialNumb\",77\r\n\"TableC(053)\",1\r\n"
                  "\"BussIdenti\",9\r\n",
                  record, name, type));
    QCOMPARE(record.ModTypeSet, 4);
    QCOMPARE(record.SerialNumb, 77);
    QCOMPARE(record.BussIdenti, 1);
}

void TestKv7File::unreadableFiles() {
    qint32 type = 0;
    SettingsSet record;
    record.LoadNote = QStringLiteral("kept");

    QVERIFY(QDir(dir->path()).mkdir(QStringLiteral("folder.kv7")));
    QString name = path(QStringLiteral("folder"));
    QVERIFY(!RestoreKVdef(name, type, record));
    QCOMPARE(name,
             QStringLiteral("Is a folder, not a file: ") + path(QStringLiteral("folder.kv7")));

    name = path(QStringLiteral("absent"));
    QVERIFY(!RestoreKVdef(name, type, record));
    QVERIFY2(name.endsWith(QLatin1Char(' ') + path(QStringLiteral("absent.kv7"))),
             qPrintable(name));
    QVERIFY(name.size() > path(QStringLiteral("absent.kv7")).size() + 1);

    QByteArray huge = "\"ModTypeSet\",4\r\n";
    huge += QByteArray(1100000, ' ');
    name = writeRaw(QStringLiteral("huge.kv7"), huge);
    QVERIFY(!RestoreKVdef(name, type, record));
    QVERIFY2(name.startsWith(QStringLiteral("Too large for a settings file: ")), qPrintable(name));

    QCOMPARE(record.LoadNote, QStringLiteral("kept"));
    QCOMPARE(record.ModTypeSet, 0);
}

void TestKv7File::restoredSetAndCopy() {
    QString name = path(QStringLiteral("pump"));
    QVERIFY(SaveKVdef(name, fullRecord()));
    writeRaw(QStringLiteral("pump.kv7"), saved(fullRecord()) + "\"Extra\",1\r\n");
    qint32 type = 0;
    QVERIFY(RestoreKVdef(name, type));
    QCOMPARE(RestoredSet().SerialNumb, 1234567);

    SettingsSet window;
    CopyRestoredSet(window);
    QCOMPARE(window.LoadNote, QStringLiteral(", Extra: 1, ") + name);
    QCOMPARE(saved(window), saved(fullRecord()));
}

// --- folders, names, launcher texts ---------------------------------------

void TestKv7File::defaultFolders() {
    const QByteArray before = qgetenv("KV700_HOME");
    qputenv("KV700_HOME", dir->path().toLocal8Bit());
    QCOMPARE(DefaultFolder(), dir->path() + QLatin1Char('/'));
    QCOMPARE(AutoSaveFolder(), dir->path() + QStringLiteral("/AutoSave/"));

    QString name = AutoSavePath(QStringLiteral("KV720-20"), QStringLiteral("SN 1234"));
    QCOMPARE(name, dir->path() + QStringLiteral("/AutoSave/KV720-20-SN 1234.kv7"));
    QVERIFY(SaveKVdef(name, fullRecord()));
    QVERIFY(QFileInfo(name).isFile());

    qunsetenv("KV700_HOME");
    QCOMPARE(DefaultFolder(), QDir::homePath() + QStringLiteral("/ORVE/KV700/"));
    if (!before.isNull())
        qputenv("KV700_HOME", before);
}

void TestKv7File::proposedNames() {
    SettingsSet record;
    record.SetFileName(QStringLiteral("Tank 1"));
    QCOMPARE(ProposedSaveName(QStringLiteral("KV714-22"), record.FileName),
             QStringLiteral("KV714-22-Tank 1              "));
    record.SetFileName(QStringLiteral("in/out: A*B?\"C\"<>|\t"));
    QCOMPARE(ProposedSaveName(QStringLiteral("KV714/8-5"), record.FileName),
             QStringLiteral("KV714_8-5-in_out_ A_B__C_____ "));
}

void TestKv7File::shellOpenMessages_data() {
    QTest::addColumn<int>("result");
    QTest::addColumn<QString>("message");
    QTest::newRow("0") << 0 << "";
    QTest::newRow("2") << 2 << "file not found";
    QTest::newRow("3") << 3 << "path not found";
    QTest::newRow("5") << 5 << "access denied";
    QTest::newRow("8") << 8 << "out of memory";
    QTest::newRow("26") << 26 << "Shareing violation";
    QTest::newRow("27") << 27 << "Association incomplete";
    QTest::newRow("28") << 28 << "DDE time out";
    QTest::newRow("29") << 29 << "DDE fail";
    QTest::newRow("30") << 30 << "DDE busy";
    QTest::newRow("31") << 31 << "No application is associated with this file type";
    QTest::newRow("32") << 32 << "DLL not found";
    QTest::newRow("1") << 1 << "? error:1";
}

void TestKv7File::shellOpenMessages() {
    QFETCH(int, result);
    QFETCH(QString, message);
    QCOMPARE(ShellOpenMessage(result), message);
    const QString guide = QStringLiteral("/opt/kv700/KV705-DS41876-UserGuide-9.pdf");
    QCOMPARE(ShellOpenFailure(result, guide), message + QLatin1Char(' ') + guide);
}

QTEST_GUILESS_MAIN(TestKv7File)
#include "tst_kv7file.moc"
