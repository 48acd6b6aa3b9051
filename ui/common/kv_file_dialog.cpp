#include "ui/common/kv_file_dialog.h"

#include "files/file_locations.h"
#include "files/kv7_file.h"

#include <QFileDialog>

namespace kv {

namespace {
constexpr int ShortestFileName = 4;
}

bool OpenDialog(QString& fileName, QWidget* owner) {
    QFileDialog dialog(owner, QStringLiteral("Open KV Series Program"), DefaultFolder());
    dialog.setNameFilters(
        {QStringLiteral("KV Series Program (*.kv7)"), QStringLiteral("All Files (*)")});
    dialog.setDefaultSuffix(QStringLiteral("kv7"));
    dialog.setFileMode(QFileDialog::ExistingFile);
    dialog.setAcceptMode(QFileDialog::AcceptOpen);
    dialog.setOption(QFileDialog::DontResolveSymlinks);
    if (!fileName.isEmpty())
        dialog.selectFile(fileName);
    if (dialog.exec() != QDialog::Accepted || dialog.selectedFiles().isEmpty())
        return false;
    fileName = dialog.selectedFiles().constFirst();
    return true;
}

bool OpenKVFile(QString& fileName, qint32& typeCode, QWidget* owner) {
    if (!OpenDialog(fileName, owner)) {
        fileName = QStringLiteral("Cancelled operation");
        return false;
    }
    if (fileName.size() < ShortestFileName) {
        fileName = QStringLiteral("Invalid file name");
        return false;
    }
    return RestoreKVdef(fileName, typeCode);
}

}  // namespace kv
