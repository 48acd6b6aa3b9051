#include "model/entry_format.h"

#include "model/entry_number.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <string>

namespace kv {

namespace {

struct Picture {
    int integerDigits = 0;  // "0" before the point
    int minDecimals = 0;    // "0" after the point
    int maxDecimals = 0;    // "0" and "#" after the point
    bool scientific = false;
    bool exponentPlus = false;  // "E+": sign always shown
    int exponentDigits = 0;
};

Picture readPicture(const QString& pattern) {
    Picture picture;
    const int exponentAt = pattern.indexOf(QLatin1Char('E'), 0, Qt::CaseInsensitive);
    const QString mantissa = exponentAt >= 0 ? pattern.left(exponentAt) : pattern;
    const int point = mantissa.indexOf(QLatin1Char('.'));
    picture.integerDigits = mantissa.left(point >= 0 ? point : mantissa.size()).count(u'0');
    if (point >= 0) {
        const QString decimals = mantissa.mid(point + 1);
        picture.minDecimals = decimals.count(u'0');
        picture.maxDecimals = picture.minDecimals + decimals.count(u'#');
    }
    if (exponentAt >= 0) {
        picture.scientific = true;
        picture.exponentPlus = pattern.mid(exponentAt + 1, 1) == QLatin1String("+");
        picture.exponentDigits = pattern.mid(exponentAt + 1).count(u'0');
    }
    return picture;
}

// Every double has a finite decimal expansion; these precisions reach its end,
// so rounding can look at the exact digits.
constexpr int ExactFixedDecimals = 1100;
constexpr int ExactMantissaDecimals = 770;

std::string exactText(double magnitude, std::chars_format format, int precision) {
    std::string text(1500, '\0');
    const auto result =
        std::to_chars(text.data(), text.data() + text.size(), magnitude, format, precision);
    text.resize(result.ptr - text.data());
    return text;
}

// Keeps the first `keep` digits; a dropped half or more rounds away from zero.
// True when the carry added a leading digit.
bool roundAway(std::string& digits, size_t keep) {
    const bool up = keep < digits.size() && digits[keep] >= '5';
    digits.resize(keep);
    if (!up)
        return false;
    for (size_t i = keep; i-- > 0;) {
        if (digits[i] != '9') {
            ++digits[i];
            return false;
        }
        digits[i] = '0';
    }
    digits.insert(digits.begin(), '1');
    return true;
}

QString withPoint(const std::string& digits, size_t whole) {
    const QString text = QString::fromStdString(digits);
    return whole < digits.size() ? text.left(whole) + QLatin1Char('.') + text.mid(whole) : text;
}

// Magnitude with maxDecimals decimals: "1234.50".
QString fixedDigits(double magnitude, int maxDecimals) {
    const std::string exact = exactText(magnitude, std::chars_format::fixed, ExactFixedDecimals);
    size_t whole = exact.find('.');
    std::string digits = exact.substr(0, whole) + exact.substr(whole + 1);
    if (roundAway(digits, whole + maxDecimals))
        ++whole;
    return withPoint(digits, whole);
}

// Mantissa with maxDecimals decimals and the power of ten: "1.23", 5.
QString scientificDigits(double magnitude, int maxDecimals, int& power) {
    const std::string exact =
        exactText(magnitude, std::chars_format::scientific, ExactMantissaDecimals);
    const size_t e = exact.find('e');
    const char* powerStart = exact.data() + e + (exact[e + 1] == '+' ? 2 : 1);
    std::from_chars(powerStart, exact.data() + exact.size(), power);
    std::string digits = exact.substr(0, 1) + exact.substr(2, e - 2);
    if (roundAway(digits, 1 + maxDecimals)) {
        digits.pop_back();
        ++power;
    }
    return withPoint(digits, 1);
}

// "d.ddd" without sign: trailing zeros dropped down to the minimum, leading
// zeros of the whole part added up to the minimum.
QString shapeDigits(QString digits, const Picture& picture) {
    const int point = digits.indexOf(QLatin1Char('.'));
    QString whole = point >= 0 ? digits.left(point) : digits;
    QString decimals = point >= 0 ? digits.mid(point + 1) : QString();
    while (decimals.size() > picture.minDecimals && decimals.endsWith(QLatin1Char('0')))
        decimals.chop(1);
    whole = whole.rightJustified(picture.integerDigits, QLatin1Char('0'));
    return decimals.isEmpty() ? whole : whole + QLatin1Char('.') + decimals;
}

struct FormatBand {
    float low;
    float high;
    const char* pattern;
};

// First band holding the value wins; beyond them the exponent formats apply.
constexpr FormatBand DisplayBands[] = {
    {0.0f, 0.0f, "0.00"},           {-0.009f, 0.0f, "0.0E-00"},       {0.0f, 0.009f, "0.00E+00"},
    {-0.9f, 9.9f, "0.0####"},       {-9.0f, 99.0f, "#0.0###"},        {-99.0f, 999.0f, "##0.0##"},
    {-999.0f, 9999.0f, "###0.0##"}, {-9999.0f, 99999.0f, "####0.0#"},
};

const char* displayPattern(float value) {
    for (const FormatBand& band : DisplayBands)
        if (value >= band.low && value <= band.high)
            return band.pattern;
    return value < 0 ? "0.0E-00" : "0.00E+00";
}

}  // namespace

QString FormatNumber(double value, const QString& pattern) {
    const Picture picture = readPicture(pattern);
    const double magnitude = std::abs(value);
    QString digits;
    QString exponent;
    if (picture.scientific) {
        int power = 0;
        digits = scientificDigits(magnitude, picture.maxDecimals, power);
        const QString sign = power < 0              ? QStringLiteral("-")
                             : picture.exponentPlus ? QStringLiteral("+")
                                                    : QString();
        exponent = QLatin1Char('E') + sign +
                   QString::number(std::abs(power))
                       .rightJustified(picture.exponentDigits, QLatin1Char('0'));
    } else {
        digits = fixedDigits(magnitude, picture.maxDecimals);
    }
    digits = shapeDigits(digits, picture);
    const bool shownAsZero =
        std::none_of(digits.cbegin(), digits.cend(), [](QChar c) { return c > u'0' && c <= u'9'; });
    const QString sign = value < 0 && !shownAsZero ? QStringLiteral("-") : QString();
    return sign + digits + exponent;
}

bool AUStxt(float value, QString& text) {
    if (!std::isfinite(value)) {
        text = QStringLiteral("AUStxt Value: ") + GeneralText(value) +
               QStringLiteral(" is not a finite number");
        return false;
    }
    text = FormatNumber(value, QLatin1String(displayPattern(value)));
    return true;
}

QString RevisionText(const QString& numberText) {
    double number = 0;
    qint32 value = 0;
    if (!ParseDecimal(numberText, number) || !RoundToLong(number, value) || value != number)
        return numberText;
    const qint32 high = (value & ~0xFF) / 256;
    return QString::number(high) + QLatin1Char('.') +
           QString::number(value & 0xFF).rightJustified(3, QLatin1Char('0'));
}

QString VarToText(const QVariant& value) {
    if (!value.isValid() || value.isNull())
        return {};
    switch (value.typeId()) {
    case QMetaType::Bool:
        return value.toBool() ? QStringLiteral("YES") : QStringLiteral("NO ");
    case QMetaType::Short:
        if (value.toInt() == 0)
            return QStringLiteral("NO ");
        if (value.toInt() == -1)
            return QStringLiteral("YES");
        return value.toString();
    case QMetaType::Float:
        return GeneralText(value.toFloat());
    case QMetaType::Double:
        return GeneralText(value.toDouble());
    default:
        break;
    }
    QString text = value.toString();
    const int carriageReturn = text.indexOf(QLatin1Char('\r'));
    if (carriageReturn >= 0)
        text.truncate(carriageReturn);
    return text.left(70);
}

}  // namespace kv
