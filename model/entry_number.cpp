#include "model/entry_number.h"

#include <QRegularExpression>
#include <charconv>
#include <cmath>
#include <limits>

namespace kv {

namespace {

// The text of a decimal number without its surrounding blanks and leading "+",
// ready for std::from_chars; empty when the text is no number.
QByteArray numberChars(const QString& text) {
    static const QRegularExpression decimal(
        QStringLiteral(R"(^[+-]?(\d+\.?\d*|\.\d+)([eE][+-]?\d+)?$)"));
    const QString trimmed = text.trimmed();
    if (!decimal.match(trimmed).hasMatch())
        return {};
    QByteArray chars = trimmed.toLatin1();
    if (chars.startsWith('+'))
        chars.remove(0, 1);
    return chars;
}

// Decides whether an out-of-range number was too small rather than too large:
// the power of ten of its first significant digit is negative.
bool belowRange(const QByteArray& chars) {
    const int exponentAt = chars.indexOf('e') >= 0 ? chars.indexOf('e') : chars.indexOf('E');
    const QByteArray mantissa = exponentAt >= 0 ? chars.left(exponentAt) : chars;
    long long exponent = 0;
    if (exponentAt >= 0) {
        QByteArray digits = chars.mid(exponentAt + 1);
        if (digits.startsWith('+'))
            digits.remove(0, 1);
        const auto result =
            std::from_chars(digits.constData(), digits.constData() + digits.size(), exponent);
        if (result.ec == std::errc::result_out_of_range)
            return digits.startsWith('-');
    }
    const int point = mantissa.indexOf('.') >= 0 ? mantissa.indexOf('.') : mantissa.size();
    for (int i = 0; i < mantissa.size(); ++i) {
        if (mantissa[i] < '1' || mantissa[i] > '9')
            continue;
        const long long power = i < point ? point - 1 - i : point - i;
        return power + exponent < 0;
    }
    return true;
}

// from_chars with underflow read as zero; false for anything else it refuses.
template <typename T>
bool fromChars(const QByteArray& chars, T& value) {
    T parsed = 0;
    const auto result =
        std::from_chars(chars.constData(), chars.constData() + chars.size(), parsed);
    if (result.ec == std::errc::result_out_of_range && belowRange(chars))
        parsed = chars.startsWith('-') ? -T(0) : T(0);
    else if (result.ec != std::errc() || result.ptr != chars.constData() + chars.size())
        return false;
    value = parsed;
    return true;
}

template <typename T>
QString toChars(T value, std::chars_format format, int precision) {
    char buffer[64];
    const auto result =
        precision < 0 ? std::to_chars(buffer, buffer + sizeof buffer, value, format)
                      : std::to_chars(buffer, buffer + sizeof buffer, value, format, precision);
    return QString::fromLatin1(buffer, result.ptr - buffer);
}

}  // namespace

bool ParseDecimal(const QString& text, double& value) {
    const QByteArray chars = numberChars(text);
    return !chars.isEmpty() && fromChars(chars, value);
}

bool ParseDecimal(const QString& text, float& value) {
    const QByteArray chars = numberChars(text);
    return !chars.isEmpty() && fromChars(chars, value);
}

bool RoundToLong(double value, qint32& result) {
    if (!std::isfinite(value))
        return false;
    double whole = std::floor(value);
    const double fraction = value - whole;
    if (fraction > 0.5 || (fraction == 0.5 && std::fmod(whole, 2.0) != 0))
        whole += 1;
    if (whole < std::numeric_limits<qint32>::min() || whole > std::numeric_limits<qint32>::max())
        return false;
    result = static_cast<qint32>(whole);
    return true;
}

QString GeneralText(double value) {
    return toChars(value, std::chars_format::general, 15);
}

QString GeneralText(float value) {
    return toChars(value, std::chars_format::general, -1);
}

}  // namespace kv
