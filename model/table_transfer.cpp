#include "model/table_transfer.h"

#include "model/codec.h"
#include "model/linearisation.h"

namespace kv {

namespace {
constexpr int PointsPerStep = 2;
constexpr int DigitsPerPoint = 4;
constexpr quint32 PointMask = 0xFFFFu;
}  // namespace

QByteArray TableStep::WireData() const {
    return ToWireDigits(quint32(first) & PointMask, DigitsPerPoint) +
           ToWireDigits(quint32(second) & PointMask, DigitsPerPoint);
}

QVector<TableStep> TableTransferSteps(const qint32* points, int lastUsed) {
    QVector<TableStep> steps;
    for (int k = 0; k <= lastUsed; k += PointsPerStep)
        steps.append(TableStep{FirstTableBusId + k, points[k], points[k + 1]});
    return steps;
}

int TableStepIndex(int busId, int lastUsed) {
    const int k = busId - FirstTableBusId;
    if (k < 0 || k > lastUsed || k % PointsPerStep != 0)
        return -1;
    return k / PointsPerStep;
}

bool CheckTableReturnId(int sentId, int returnedId, bool writing, QString& message) {
    if (sentId == returnedId)
        return true;
    if (writing)
        message = QStringLiteral("? table Send_ID:") + QString::number(sentId) +
                  QStringLiteral(" Return_ID:") + QString::number(returnedId);
    else
        message = QStringLiteral("Send ID:") + QString::number(sentId) +
                  QStringLiteral(" <> Return ID:") + QString::number(returnedId);
    return false;
}

bool CheckTableReadBack(const qint32* points, int lastUsed, QString& message) {
    const qint32 received = points[lastUsed + 1];
    if ((quint32(received) & PointMask) == quint32(TableChecksumOf(points, lastUsed)))
        return true;
    message = QStringLiteral("Table Check Sum Fail  ") + QString::number(points[lastUsed]) +
              QLatin1Char(',') + QString::number(received);
    return false;
}

}  // namespace kv
