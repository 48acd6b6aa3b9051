#include "ui/common/document_launcher.h"

#include "files/shell_open.h"

#include <QCoreApplication>
#include <QDesktopServices>
#include <QFileInfo>
#include <QUrl>

namespace kv {

namespace {
// The launcher's result codes for what can go wrong here.
constexpr int FileNotFound = 2;
constexpr int NoAssociation = 31;
}  // namespace

bool ShellOpen(QString& path) {
    int result = ShellOpenSuccess;
    if (!QFileInfo::exists(path))
        result = FileNotFound;
    else if (!QDesktopServices::openUrl(QUrl::fromLocalFile(path)))
        result = NoAssociation;
    QCoreApplication::processEvents();
    if (result == ShellOpenSuccess)
        return true;
    path = ShellOpenFailure(result, path);
    return false;
}

}  // namespace kv
