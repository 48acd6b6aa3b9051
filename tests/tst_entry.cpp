#include "model/entry_check.h"
#include "model/entry_format.h"
#include "model/entry_number.h"
#include "model/entry_user_cal.h"
#include "model/range_table.h"

#include <QtTest>
#include <clocale>
#include <limits>

using namespace kv;

Q_DECLARE_METATYPE(kv::LabelColour)

namespace {

RangeDescriptor range(float minimum, float maximum, qint32 countMin, qint32 countMax,
                      const QString& unit) {
    RangeDescriptor d;
    d.minimum = minimum;
    d.maximum = maximum;
    d.countMin = countMin;
    d.countMax = countMax;
    d.unit = unit;
    return d;
}

// Input 1 of a KV716 (map 2): entry 3 is 4-20 mA, entry 4 the same range with
// the " LP" suffix; entry 8 is 1-5 V.
RangeTable& kv716InputTable() {
    RangeTable& table = ProgramRangeTable(Input1);
    table[3] = range(4, 20, 1200, 6000, QStringLiteral("mA"));
    table[3].description = QStringLiteral("4--20mA");
    table[4] = table[3];
    table[4].unit += QStringLiteral(" LP");
    table[4].description += QStringLiteral(" LP");
    table[8] = range(1, 5, 900, 4500, QStringLiteral("V"));
    return table;
}

}  // namespace

class TestEntry : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();

    void checkNumeric_data();
    void checkNumeric();
    void checkLimits_data();
    void checkLimits();
    void checkOrderMarksBothFields();
    void checkPair_data();
    void checkPair();

    void userRangeCheck_data();
    void userRangeCheck();
    void userRangeCheckLimitFollowsRange();
    void userRangeCheckRefusesUnknownRange();

    void usrCalRangeSet_data();
    void usrCalRangeSet();
    void usrCalRangeSetRefuses_data();
    void usrCalRangeSetRefuses();
    void getUserCal_data();
    void getUserCal();
    void getUserCalRefuses_data();
    void getUserCalRefuses();
    void countsRoundTrip();
    void userCalToEngAccumulatesErrors();

    void austxt_data();
    void austxt();
    void austxtRefusesNonFinite();
    void formatPatterns_data();
    void formatPatterns();
    void revisionText_data();
    void revisionText();
    void varToText_data();
    void varToText();

    void parseDecimal_data();
    void parseDecimal();
    void roundToLongHalvesToEven();
};

void TestEntry::initTestCase() {
    // A decimal-comma locale must change nothing the user sees or types.
    QLocale::setDefault(QLocale(QLocale::German, QLocale::Germany));
    std::setlocale(LC_ALL, "de_DE.UTF-8");
}

// --- numeric entry -------------------------------------------------------

void TestEntry::checkNumeric_data() {
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<QString>("appended");
    const auto row = [](const char* tag, const char* text, const char* name, bool ok,
                        const QString& appended) {
        QTest::newRow(tag) << text << name << ok << appended;
    };
    const QString comma = QStringLiteral(" Must use a \".\" not a \",\" when entering decimals. ");
    const QString notNumeric = QStringLiteral(" Must Be Numeric ");
    row("decimal", "12.5", "Zero", true, "");
    row("blanks and sign", " -3 ", "Zero", true, "");
    row("exponent", "1e3", "Zero", true, "");
    row("no leading digit", ".5", "Zero", true, "");
    row("comma decimal", "12,5", "Zero", false, "Zero" + comma);
    row("comma without name", "12,5", "", false, comma);
    row("group separator", "1,000.5", "Full", false, "Full" + comma);
    row("letters", "abc", "Zero", false, "Zero" + notNumeric);
    row("letters without name", "abc", "", false, " Value" + notNumeric);
    row("comma between letters", "a,b", "Zero", false, "Zero" + notNumeric);
    row("empty", "", "Zero", false, "Zero" + notNumeric);
    row("two points", "1.2.3", "Zero", false, "Zero" + notNumeric);
    row("hexadecimal", "0x10", "Zero", false, "Zero" + notNumeric);
    row("not a number", "nan", "Zero", false, "Zero" + notNumeric);
    row("infinity", "inf", "Zero", false, "Zero" + notNumeric);
}

void TestEntry::checkNumeric() {
    QFETCH(QString, text);
    QFETCH(QString, name);
    QFETCH(bool, ok);
    QFETCH(QString, appended);
    QString message = QStringLiteral("Earlier.");
    QCOMPARE(CheckNumeric(text, message, name), ok);
    QCOMPARE(message, "Earlier." + appended);
}

void TestEntry::checkLimits_data() {
    QTest::addColumn<QString>("text");
    QTest::addColumn<double>("minimum");
    QTest::addColumn<double>("maximum");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<QString>("message");
    QTest::newRow("lower bound included") << "3" << 3.0 << 21.0 << true << "";
    QTest::newRow("upper bound included") << "21" << 3.0 << 21.0 << true << "";
    QTest::newRow("below") << "2.9" << 3.0 << 21.0 << false << "2.9 < 3";
    QTest::newRow("above") << "21.5" << 3.0 << 21.0 << false << "21.5 > 21";
    QTest::newRow("fractional bound") << " 0.5 " << 0.75 << 5.0 << false << "0.5 < 0.75";
    QTest::newRow("not numeric") << "fast" << 10.0 << 4000.0 << false << "Samples Must Be Numeric ";
    QTest::newRow("comma") << "5,5" << 0.0 << 10.0 << false
                           << "Samples Must use a \".\" not a \",\" when entering decimals. ";
}

void TestEntry::checkLimits() {
    QFETCH(QString, text);
    QFETCH(double, minimum);
    QFETCH(double, maximum);
    QFETCH(bool, ok);
    QFETCH(QString, message);
    QString result;
    QCOMPARE(CheckLimits({text, QStringLiteral("Samples")}, minimum, maximum, result), ok);
    QCOMPARE(result, message);
}

void TestEntry::checkOrderMarksBothFields() {
    const EntryField low{QStringLiteral("5"), QStringLiteral("Zero")};
    QString message;
    LabelMarks marks;
    QVERIFY(!CheckOrder(low, {QStringLiteral("4.99"), QStringLiteral("Full")}, message, marks));
    QCOMPARE(message, QStringLiteral("Full must be > Zero"));
    QCOMPARE(marks.first, LabelColour::Error);
    QCOMPARE(marks.second, LabelColour::Error);

    message.clear();
    marks = {};
    QVERIFY(CheckOrder(low, {QStringLiteral("5"), QStringLiteral("Full")}, message, marks));
    QVERIFY(message.isEmpty());
    QCOMPARE(marks.first, LabelColour::Keep);

    QVERIFY(!CheckOrder(low, {QStringLiteral("x"), QStringLiteral("Full")}, message, marks));
    QCOMPARE(message, QStringLiteral("Full Must Be Numeric "));
    QCOMPARE(marks.first, LabelColour::Keep);
    QCOMPARE(marks.second, LabelColour::Error);
}

void TestEntry::checkPair_data() {
    QTest::addColumn<QString>("low");
    QTest::addColumn<QString>("high");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<QString>("message");
    QTest::addColumn<LabelColour>("lowMark");
    QTest::addColumn<LabelColour>("highMark");
    const auto N = LabelColour::Normal;
    const auto E = LabelColour::Error;
    const auto row = [](const char* tag, const char* low, const char* high, bool ok,
                        const char* message, LabelColour lowMark, LabelColour highMark) {
        QTest::newRow(tag) << low << high << ok << message << lowMark << highMark;
    };
    row("in order", "1", "2", true, "", N, N);
    row("equal", "5", "5", true, "", N, N);
    row("first too high", "11", "2", false, "11 > 10", E, N);
    row("second too low", "1", "-1", false, "-1 < 0", N, E);
    row("both outside, first reported", "11", "-1", false, "11 > 10", E, E);
    row("reversed", "5", "4", false, "High must be > Low", E, E);
}

void TestEntry::checkPair() {
    QFETCH(QString, low);
    QFETCH(QString, high);
    QFETCH(bool, ok);
    QFETCH(QString, message);
    QFETCH(LabelColour, lowMark);
    QFETCH(LabelColour, highMark);
    QString result;
    LabelMarks marks;
    QCOMPARE(CheckPair({low, QStringLiteral("Low")}, {high, QStringLiteral("High")}, 0, 10, result,
                       marks),
             ok);
    QCOMPARE(result, message);
    QCOMPARE(marks.first, lowMark);
    QCOMPARE(marks.second, highMark);
}

// --- user range against a range table -----------------------------------

void TestEntry::userRangeCheck_data() {
    QTest::addColumn<QString>("zero");
    QTest::addColumn<QString>("full");
    QTest::addColumn<QString>("message");
    QTest::addColumn<LabelColour>("zeroMark");
    QTest::addColumn<LabelColour>("fullMark");
    const auto K = LabelColour::Keep;
    const auto N = LabelColour::Normal;
    const auto E = LabelColour::Error;
    const auto row = [](const char* tag, const char* zero, const char* full, const char* message,
                        LabelColour zeroMark, LabelColour fullMark) {
        QTest::newRow(tag) << zero << full << message << zeroMark << fullMark;
    };
    // 4-20 mA: zero down to 4 - 0.05 * 20 = 3, full scale up to 1.05 * 20 = 21.
    row("lowest zero", "3", "20", "", N, N);
    row("zero below limit", "2.9", "20", "Min < 3", E, N);
    row("highest full", "4", "21", "", N, N);
    row("full above limit", "4", "21.5", "Max > 21", N, LabelColour::Red);
    row("negative zero first", "-1", "20", "Min < 0", E, N);
    row("zero above range", "20.5", "21", "Min Too High", E, N);
    row("full below range", "4", "3.5", "Max Too Low", N, E);
    row("same", "10", "10", "Cannot be the same", E, E);
    row("reverse action", "20", "4", "", N, N);
    row("zero not numeric", "x", "20", "Min not unmeric", E, K);
    row("zero with comma", "12,5", "20", "Min not unmeric", E, K);
    row("full not numeric", "4", "", "Max not unmeric", K, E);
}

void TestEntry::userRangeCheck() {
    QFETCH(QString, zero);
    QFETCH(QString, full);
    QFETCH(QString, message);
    QFETCH(LabelColour, zeroMark);
    QFETCH(LabelColour, fullMark);
    UserRange result{-7, -7, QStringLiteral("unchanged")};
    QString text;
    LabelMarks marks;
    const bool ok = UserRangeCheck(kv716InputTable(), 4, zero, full, result, text, marks);
    QCOMPARE(ok, message.isEmpty());
    QCOMPARE(text, message);
    QCOMPARE(marks.first, zeroMark);
    QCOMPARE(marks.second, fullMark);
    if (ok) {
        QCOMPARE(result.zero, zero.toFloat());
        QCOMPARE(result.full, full.toFloat());
        QCOMPARE(result.unit, QStringLiteral("mA LP"));
    } else {
        QCOMPARE(result.unit, QStringLiteral("unchanged"));
    }
}

void TestEntry::userRangeCheckLimitFollowsRange() {
    UserRange result;
    QString message;
    LabelMarks marks;
    QVERIFY(!UserRangeCheck(kv716InputTable(), 8, QStringLiteral("0.7"), QStringLiteral("5"),
                            result, message, marks));
    QCOMPARE(message, QStringLiteral("Min < 0.75"));
    QVERIFY(!UserRangeCheck(kv716InputTable(), 8, QStringLiteral("1"), QStringLiteral("5.3"),
                            result, message, marks));
    QCOMPARE(message, QStringLiteral("Max > 5.25"));
    QVERIFY(UserRangeCheck(kv716InputTable(), 8, QStringLiteral("0.75"), QStringLiteral("5.25"),
                           result, message, marks));
    QCOMPARE(result.unit, QStringLiteral("V"));
}

void TestEntry::userRangeCheckRefusesUnknownRange() {
    for (int number : {-1, RangeEntries}) {
        UserRange result;
        QString message;
        LabelMarks marks;
        QVERIFY(!UserRangeCheck(kv716InputTable(), number, QStringLiteral("4"),
                                QStringLiteral("20"), result, message, marks));
        QCOMPARE(message, QStringLiteral("Failed to get range details"));
        QCOMPARE(marks.first, LabelColour::Keep);
        QCOMPARE(marks.second, LabelColour::Keep);
    }
}

// --- engineering values and counts ---------------------------------------

void TestEntry::usrCalRangeSet_data() {
    QTest::addColumn<float>("minimum");
    QTest::addColumn<float>("maximum");
    QTest::addColumn<qint32>("countMin");
    QTest::addColumn<qint32>("countMax");
    QTest::addColumn<float>("zero");
    QTest::addColumn<float>("full");
    QTest::addColumn<qint32>("zeroCount");
    QTest::addColumn<qint32>("fullCount");
    // The half added before rounding lands exactly on .5 at the range ends.
    QTest::newRow("even counts stay") << 4.f << 20.f << 1000 << 9000 << 4.f << 20.f << 1000 << 9000;
    QTest::newRow("odd counts go up") << 4.f << 20.f << 1001 << 9001 << 4.f << 20.f << 1002 << 9002;
    QTest::newRow("mid scale to even")
        << 4.f << 20.f << 1000 << 9000 << 12.f << 20.f << 5000 << 9000;
    QTest::newRow("mid scale exact") << 4.f << 20.f << 1000 << 9001 << 12.f << 20.f << 5001 << 9002;
    QTest::newRow("widest user range") << 4.f << 20.f << 1000 << 9000 << 3.f << 21.f << 500 << 9500;
    QTest::newRow("below zero on a 0-20 range")
        << 0.f << 20.f << 2000 << 12000 << -1.f << 20.f << 1500 << 12000;
    QTest::newRow("reverse action") << 0.f << 10.f << 100 << 20100 << 10.f << 0.f << 20100 << 100;
}

void TestEntry::usrCalRangeSet() {
    QFETCH(float, minimum);
    QFETCH(float, maximum);
    QFETCH(qint32, countMin);
    QFETCH(qint32, countMax);
    QFETCH(float, zero);
    QFETCH(float, full);
    QFETCH(qint32, zeroCount);
    QFETCH(qint32, fullCount);
    qint32 zeroResult = -1;
    qint32 fullResult = -1;
    QString message;
    QVERIFY(UsrCalRangeSet(range(minimum, maximum, countMin, countMax, "mA"), zero, full,
                           zeroResult, fullResult, message));
    QCOMPARE(zeroResult, zeroCount);
    QCOMPARE(fullResult, fullCount);
}

void TestEntry::usrCalRangeSetRefuses_data() {
    QTest::addColumn<qint32>("countMin");
    QTest::addColumn<float>("zero");
    QTest::addColumn<float>("full");
    QTest::addColumn<QString>("message");
    QTest::newRow("counts not read")
        << 0 << 4.f << 20.f << "UsrCalRangeSet: Update Calibration Values";
    QTest::newRow("zero below limit") << 1000 << 2.9f << 20.f << "UsrCalRangeSet: Min < 3";
    QTest::newRow("zero above range") << 1000 << 20.5f << 21.f << "UsrCalRangeSet: Min Too High";
    QTest::newRow("full below range") << 1000 << 4.f << 3.5f << "UsrCalRangeSet: Max Too Low";
    QTest::newRow("full above limit") << 1000 << 4.f << 21.5f << "UsrCalRangeSet: Max > 21";
    QTest::newRow("same") << 1000 << 8.f << 8.f << "UsrCalRangeSet: Cannot be the same";
    // The range's own zero lies far above count zero only when calibrated so.
    QTest::newRow("negative zero count") << 100 << 3.f << 20.f << "Output Zero too low";
}

void TestEntry::usrCalRangeSetRefuses() {
    QFETCH(qint32, countMin);
    QFETCH(float, zero);
    QFETCH(float, full);
    QFETCH(QString, message);
    qint32 zeroCount = -7;
    qint32 fullCount = -7;
    QString result;
    QVERIFY(!UsrCalRangeSet(range(4, 20, countMin, 9000, "mA"), zero, full, zeroCount, fullCount,
                            result));
    QCOMPARE(result, message);
    QCOMPARE(zeroCount, -7);
    QCOMPARE(fullCount, -7);
}

void TestEntry::getUserCal_data() {
    QTest::addColumn<qint32>("zeroCount");
    QTest::addColumn<qint32>("fullCount");
    QTest::addColumn<float>("zero");
    QTest::addColumn<float>("full");
    // 4-20 mA over counts 1000..9000: one count is 0.002 mA.
    QTest::newRow("range ends") << 1000 << 9000 << 4.f << 20.f;
    QTest::newRow("mid scale") << 5000 << 3000 << 12.f << 8.f;
    QTest::newRow("rounded down to 2 decimals") << 1001 << 1002 << 4.f << 4.f;
    QTest::newRow("rounded up to 2 decimals") << 1003 << 1005 << 4.01f << 4.01f;
    QTest::newRow("below the range") << 500 << 9500 << 3.f << 21.f;
}

void TestEntry::getUserCal() {
    QFETCH(qint32, zeroCount);
    QFETCH(qint32, fullCount);
    QFETCH(float, zero);
    QFETCH(float, full);
    float zeroValue = -1;
    float fullValue = -1;
    QString message;
    QVERIFY(GetUserCal(range(4, 20, 1000, 9000, "mA"), zeroCount, fullCount, zeroValue, fullValue,
                       message, QStringLiteral("Out 1")));
    QCOMPARE(zeroValue, zero);
    QCOMPARE(fullValue, full);
}

void TestEntry::getUserCalRefuses_data() {
    QTest::addColumn<qint32>("countMin");
    QTest::addColumn<qint32>("countMax");
    QTest::addColumn<qint32>("zeroCount");
    QTest::addColumn<QString>("message");
    QTest::newRow("range counts not read") << 0 << 9000 << 2000 << "Out 1 Invalid Cal Values";
    QTest::newRow("user counts not read") << 1000 << 9000 << 0 << "Out 1 Invalid User Cal";
    QTest::newRow("equal range counts")
        << 5000 << 5000 << 2000 << "Out 1 Get User Cal Error: Division by zero";
}

void TestEntry::getUserCalRefuses() {
    QFETCH(qint32, countMin);
    QFETCH(qint32, countMax);
    QFETCH(qint32, zeroCount);
    QFETCH(QString, message);
    float zero = -1;
    float full = -1;
    QString result;
    QVERIFY(!GetUserCal(range(4, 20, countMin, countMax, "mA"), zeroCount, 8000, zero, full, result,
                        QStringLiteral("Out 1")));
    QCOMPARE(result, message);
    QCOMPARE(zero, -1.f);
}

void TestEntry::countsRoundTrip() {
    const RangeDescriptor output = range(0, 10, 3217, 52981, "V");
    for (float zero : {0.f, 0.25f, 1.5f, 2.f}) {
        for (float full : {5.f, 9.99f, 10.f, 10.5f}) {
            qint32 zeroCount = 0;
            qint32 fullCount = 0;
            float zeroBack = -1;
            float fullBack = -1;
            QString message;
            QVERIFY(UsrCalRangeSet(output, zero, full, zeroCount, fullCount, message));
            QVERIFY(GetUserCal(output, zeroCount, fullCount, zeroBack, fullBack, message, "Out"));
            QCOMPARE(zeroBack, zero);
            QCOMPARE(fullBack, full);
        }
    }
}

void TestEntry::userCalToEngAccumulatesErrors() {
    float zero = -1;
    float full = -1;
    QString unit;
    QString errors;
    QVERIFY(
        UserCalToEng(range(4, 20, 1000, 9000, "mA"), 1000, 9000, zero, full, unit, errors, "In 1"));
    QCOMPARE(unit, QStringLiteral("mA"));
    QCOMPARE(full, 20.f);
    QVERIFY(errors.isEmpty());

    QVERIFY(
        !UserCalToEng(range(4, 20, 0, 9000, "mA"), 1000, 9000, zero, full, unit, errors, "Out 1"));
    QCOMPARE(unit, QStringLiteral("??"));
    QCOMPARE(zero, 0.f);
    QCOMPARE(full, 0.f);
    QVERIFY(
        !UserCalToEng(range(4, 20, 1000, 9000, "mA"), 0, 9000, zero, full, unit, errors, "Out 2"));
    QCOMPARE(errors, QStringLiteral("Out 1 Invalid Cal Values, Out 2 Invalid User Cal, "));
}

// --- display texts -------------------------------------------------------

void TestEntry::austxt_data() {
    QTest::addColumn<float>("value");
    QTest::addColumn<QString>("text");
    QTest::newRow("zero") << 0.f << "0.00";
    QTest::newRow("negative zero") << -0.f << "0.00";
    QTest::newRow("small positive") << 0.005f << "5.00E-03";
    QTest::newRow("small positive bound") << 0.009f << "9.00E-03";
    QTest::newRow("just above small bound") << 0.0091f << "0.0091";
    QTest::newRow("small negative") << -0.005f << "-5.0E-03";
    QTest::newRow("small negative bound") << -0.009f << "-9.0E-03";
    QTest::newRow("negative half") << -0.5f << "-0.5";
    QTest::newRow("five decimals") << 1.234567f << "1.23457";
    QTest::newRow("one decimal kept") << 5.f << "5.0";
    QTest::newRow("first band top") << 9.9f << "9.9";
    QTest::newRow("four decimals") << 12.345678f << "12.3457";
    QTest::newRow("three decimals") << 123.4f << "123.4";
    QTest::newRow("thousands") << 1234.5678f << "1234.568";
    QTest::newRow("ten thousands") << 12345.678f << "12345.68";
    QTest::newRow("last fixed band top") << 99999.f << "99999.0";
    QTest::newRow("large positive") << 123456.f << "1.23E+05";
    QTest::newRow("large negative") << -123456.f << "-1.2E05";
    QTest::newRow("below last negative band") << -12345.6f << "-1.2E04";
    QTest::newRow("tiny positive") << 1e-20f << "1.00E-20";
    QTest::newRow("huge") << 3e38f << "3.00E+38";
    QTest::newRow("mantissa carries") << 999999.f << "1.00E+06";
}

void TestEntry::austxt() {
    QFETCH(float, value);
    QFETCH(QString, text);
    QString result;
    QVERIFY(AUStxt(value, result));
    QCOMPARE(result, text);
}

void TestEntry::austxtRefusesNonFinite() {
    QString text;
    QVERIFY(!AUStxt(std::numeric_limits<float>::quiet_NaN(), text));
    QVERIFY(text.startsWith(QStringLiteral("AUStxt Value: nan")));
    QVERIFY(!AUStxt(-std::numeric_limits<float>::infinity(), text));
    QVERIFY(text.startsWith(QStringLiteral("AUStxt Value: -inf")));
}

void TestEntry::formatPatterns_data() {
    QTest::addColumn<double>("value");
    QTest::addColumn<QString>("pattern");
    QTest::addColumn<QString>("text");
    const auto row = [](const char* tag, double value, const char* pattern, const char* text) {
        QTest::newRow(tag) << value << pattern << text;
    };
    row("two decimals always", 1234.5, "0.00", "1234.50");
    row("rounded to zero has no sign", -0.001, "0.00", "0.00");
    row("exact half away from zero", 4.125, "0.00", "4.13");
    row("negative half away from zero", -0.625, "0.00", "-0.63");
    row("just below half", 4.1249999, "0.00", "4.12");
    row("carry into whole part", 9.999, "0.00", "10.00");
    row("leading zeros", 7.25, "000.0", "007.3");
    row("exponent digits", 1e-120, "0.0E+00", "1.0E-120");
}

void TestEntry::formatPatterns() {
    QFETCH(double, value);
    QFETCH(QString, pattern);
    QFETCH(QString, text);
    QCOMPARE(FormatNumber(value, pattern), text);
}

void TestEntry::revisionText_data() {
    QTest::addColumn<QString>("number");
    QTest::addColumn<QString>("text");
    const auto row = [](const char* tag, const char* number, const char* text) {
        QTest::newRow(tag) << number << text;
    };
    row("2.003", "515", "2.003");
    row("zero", "0", "0.000");
    row("low byte only", "255", "0.255");
    row("beyond one byte", "66051", "258.003");
    row("blanks", " 515 ", "2.003");
    row("not a number", "abc", "abc");
    row("not an integer", "2.5", "2.5");
}

void TestEntry::revisionText() {
    QFETCH(QString, number);
    QFETCH(QString, text);
    QCOMPARE(RevisionText(number), text);
}

void TestEntry::varToText_data() {
    QTest::addColumn<QVariant>("value");
    QTest::addColumn<QString>("text");
    QTest::newRow("empty") << QVariant() << "";
    QTest::newRow("short zero") << QVariant::fromValue(qint16(0)) << "NO ";
    QTest::newRow("short minus one") << QVariant::fromValue(qint16(-1)) << "YES";
    QTest::newRow("short other") << QVariant::fromValue(qint16(12)) << "12";
    QTest::newRow("false") << QVariant(false) << "NO ";
    QTest::newRow("true") << QVariant(true) << "YES";
    QTest::newRow("integer") << QVariant(-42) << "-42";
    QTest::newRow("integer zero") << QVariant(0) << "0";
    QTest::newRow("double") << QVariant(0.5) << "0.5";
    QTest::newRow("float") << QVariant(0.1f) << "0.1";
    QTest::newRow("text to carriage return") << QVariant("line one\rline two") << "line one";
    QTest::newRow("long text") << QVariant(QString(100, u'x')) << QString(70, u'x');
}

void TestEntry::varToText() {
    QFETCH(QVariant, value);
    QFETCH(QString, text);
    QCOMPARE(VarToText(value), text);
}

// --- locale-free numbers -------------------------------------------------

void TestEntry::parseDecimal_data() {
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<double>("value");
    QTest::newRow("plus sign") << "+5" << true << 5.0;
    QTest::newRow("trailing point") << "5." << true << 5.0;
    QTest::newRow("exponent") << "-1.5e3" << true << -1500.0;
    QTest::newRow("underflow is zero") << "1e-400" << true << 0.0;
    QTest::newRow("tiny with many zeros") << "0." + QString(400, u'0') + "1" << true << 0.0;
    QTest::newRow("overflow") << "1e400" << false << 0.0;
    QTest::newRow("huge exponent") << "1e99999999999999999999" << false << 0.0;
    QTest::newRow("decimal comma") << "1,5" << false << 0.0;
    QTest::newRow("inner blank") << "1 5" << false << 0.0;
}

void TestEntry::parseDecimal() {
    QFETCH(QString, text);
    QFETCH(bool, ok);
    QFETCH(double, value);
    double result = -99;
    QCOMPARE(ParseDecimal(text, result), ok);
    QCOMPARE(result, ok ? value : -99.0);
}

void TestEntry::roundToLongHalvesToEven() {
    qint32 result = 0;
    const struct {
        double value;
        qint32 expected;
    } cases[] = {{2.5, 2}, {3.5, 4}, {-2.5, -2}, {-3.5, -4}, {2.4999, 2}, {-0.5, 0}, {7.0, 7}};
    for (const auto& c : cases) {
        QVERIFY(RoundToLong(c.value, result));
        QCOMPARE(result, c.expected);
    }
    QVERIFY(RoundToLong(2147483647.4, result));
    QCOMPARE(result, 2147483647);
    QVERIFY(!RoundToLong(2147483647.5, result));
    QVERIFY(!RoundToLong(std::numeric_limits<double>::quiet_NaN(), result));
}

QTEST_GUILESS_MAIN(TestEntry)
#include "tst_entry.moc"
