#include "files/shell_open.h"

namespace kv {

namespace {

struct ResultText {
    int result;
    const char* message;
};

constexpr ResultText ShellResults[] = {
    {0, ""},
    {2, "file not found"},
    {3, "path not found"},
    {5, "access denied"},
    {8, "out of memory"},
    {26, "Shareing violation"},
    {27, "Association incomplete"},
    {28, "DDE time out"},
    {29, "DDE fail"},
    {30, "DDE busy"},
    {31, "No application is associated with this file type"},
    {32, "DLL not found"},
};

}  // namespace

QString ShellOpenMessage(int result) {
    for (const ResultText& row : ShellResults)
        if (row.result == result)
            return QLatin1String(row.message);
    return QStringLiteral("? error:") + QString::number(result);
}

QString ShellOpenFailure(int result, const QString& path) {
    return ShellOpenMessage(result) + QLatin1Char(' ') + path;
}

}  // namespace kv
