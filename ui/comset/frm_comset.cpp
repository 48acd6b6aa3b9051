#include "ui/comset/frm_comset.h"

#include "engine/app_settings.h"
#include "engine/diagnostics.h"
#include "ui/common/colour_palette.h"
#include "ui/comset/port_probe.h"
#include "ui/hub/hub.h"

#include <QApplication>
#include <QCloseEvent>
#include <QComboBox>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QTimer>
#include <QTreeWidget>
#include <QVBoxLayout>

namespace kv {

namespace {
constexpr int LoadDelayMs = 100;
const char* const adapterNames[] = {"QTR490-02", "KV705-01"};
const char* const themeNames[] = {"White / Green", "White / Red"};
const char* const buttonCaptions[] = {"Connect", "Search Again", "Close"};
const char* const buttonTips[] = {
    "Connect to the module on the selected port and remember the port and adapter",
    "Look for ports and modules again", "Close this window"};
}  // namespace

frmComSet::frmComSet(hub& owner)
    : QWidget(&owner, Qt::Window), owner_(owner), lstPorts_(new QTreeWidget(this)),
      cboAdapter_(new QComboBox(this)), cboTheme_(new QComboBox(this)),
      labMessage_(new QLabel(this)), labAdvice_(new QLabel(this)) {
    setObjectName(QStringLiteral("frmComSet"));
    setWindowTitle(QStringLiteral("KV700 Settings"));

    lstPorts_->setObjectName(QStringLiteral("lstPorts"));
    lstPorts_->setHeaderLabels({QStringLiteral("Port"), QStringLiteral("Device")});
    lstPorts_->setRootIsDecorated(false);
    lstPorts_->setUniformRowHeights(true);
    lstPorts_->setAlternatingRowColors(true);
    lstPorts_->header()->setSectionResizeMode(0, QHeaderView::ResizeToContents);
    lstPorts_->header()->setStretchLastSection(true);
    lstPorts_->setMinimumHeight(200);

    cboAdapter_->setObjectName(QStringLiteral("cboAdapter"));
    for (const char* name : adapterNames)
        cboAdapter_->addItem(QString::fromLatin1(name));
    cboTheme_->setObjectName(QStringLiteral("cboTheme"));
    for (const char* name : themeNames)
        cboTheme_->addItem(QString::fromLatin1(name));
    connect(cboTheme_, &QComboBox::activated, &owner_, &hub::ChangeColourTheme);

    labMessage_->setObjectName(QStringLiteral("labMessage"));
    labMessage_->setWordWrap(true);
    labMessage_->setFrameShape(QFrame::StyledPanel);
    labMessage_->setMargin(6);
    labMessage_->setMinimumHeight(labMessage_->fontMetrics().height() * 2 + 12);
    labMessage_->setTextInteractionFlags(Qt::TextSelectableByMouse);

    labAdvice_->setObjectName(QStringLiteral("labAdvice"));
    labAdvice_->setWordWrap(true);
    labAdvice_->setTextInteractionFlags(Qt::TextSelectableByMouse);
    labAdvice_->hide();

    for (int i = 0; i < 3; ++i) {
        cmdSet_[i] = new QPushButton(QString::fromLatin1(buttonCaptions[i]), this);
        cmdSet_[i]->setObjectName(QStringLiteral("cmdSet%1").arg(i));
        cmdSet_[i]->setToolTip(QString::fromLatin1(buttonTips[i]));
    }
    cmdSet_[CmdApply]->setDefault(true);
    connect(cmdSet_[CmdApply], &QPushButton::clicked, this, &frmComSet::ApplySettings);
    connect(cmdSet_[CmdSearch], &QPushButton::clicked, this, &frmComSet::LoadPropertySettings);
    connect(cmdSet_[CmdClose], &QPushButton::clicked, this, &QWidget::close);
    connect(lstPorts_, &QTreeWidget::itemDoubleClicked, this, &frmComSet::ApplySettings);

    auto* choices = new QFormLayout;
    choices->addRow(QStringLiteral("Adapter type:"), cboAdapter_);
    choices->addRow(QStringLiteral("Colour theme:"), cboTheme_);
    auto* buttons = new QHBoxLayout;
    buttons->addWidget(cmdSet_[CmdSearch]);
    buttons->addStretch();
    buttons->addWidget(cmdSet_[CmdApply]);
    buttons->addWidget(cmdSet_[CmdClose]);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(14, 14, 14, 14);
    layout->setSpacing(10);
    layout->addWidget(
        new QLabel(QStringLiteral("COM ports found, with the module that answered:"), this));
    layout->addWidget(lstPorts_, 1);
    layout->addWidget(labAdvice_);
    layout->addLayout(choices);
    layout->addLayout(buttons);
    layout->addWidget(labMessage_);
    resize(560, 460);

    SetColour();
    AddMessage(QStringLiteral("Please Wait ..."));
    QTimer::singleShot(LoadDelayMs, this, &frmComSet::LoadPropertySettings);
}

void frmComSet::AddMessage(const QString& text) {
    labMessage_->setText(text);
    if (text == QLatin1String("Run Mode"))
        QTimer::singleShot(0, this, &QWidget::close);
}

QString frmComSet::message() const {
    return labMessage_->text();
}

void frmComSet::LoadPropertySettings() {
    if (probing_)
        return;
    AddMessage(QStringLiteral("Load Settings"));
    QApplication::setOverrideCursor(Qt::WaitCursor);
    setBusy(true);
    cboAdapter_->setCurrentIndex(
        owner_.GetConnector() == 0 || owner_.GetConnector() == 1 ? owner_.GetConnector() : -1);
    cboTheme_->setCurrentIndex(ColourTheme());
    lstPorts_->clear();
    labAdvice_->clear();
    labAdvice_->hide();
    for (int port = FirstProbedPort; port <= LastProbedPort; ++port) {
        addProbedPort(qint16(port));
        AddMessage(
            QStringLiteral("Load Settings: COM%1 of %2 searched").arg(port).arg(LastProbedPort));
        // Repaint between ports: the whole search can take several seconds.
        QApplication::processEvents(QEventLoop::ExcludeUserInputEvents);
    }
    QApplication::restoreOverrideCursor();
    setBusy(false);
    for (int i = 0; i < lstPorts_->topLevelItemCount(); ++i) {
        QTreeWidgetItem* item = lstPorts_->topLevelItem(i);
        if (item->data(0, Qt::UserRole).toInt() == owner_.GetComPortID())
            lstPorts_->setCurrentItem(item);
    }
    AddMessage(QStringLiteral("Select a COM port and press Connect."));
}

void frmComSet::addProbedPort(qint16 port) {
    QString error;
    owner_.OpenCom(false, error);
    ShowStatus(QString());
    const qint16 adapter = qint16(qMax(0, cboAdapter_->currentIndex()));
    const std::optional<QString> entry = ProbePort(port, adapter, error);
    if (!entry)
        return;
    auto* item = new QTreeWidgetItem(lstPorts_, {*entry, ProbeDeviceNote(port, error)});
    item->setData(0, Qt::UserRole, int(port));
    item->setToolTip(1, item->text(1));
    if (ProbeDeniedAccess(error) && labAdvice_->isHidden()) {
        labAdvice_->setText(PermissionAdvice(port));
        labAdvice_->show();
    }
}

void frmComSet::ApplySettings() {
    if (probing_)
        return;
    const qint16 previousConnector = owner_.GetConnector();
    const qint16 previousPort = owner_.GetComPortID();
    const qint16 adapter =
        cboAdapter_->currentIndex() < 0 ? previousConnector : qint16(cboAdapter_->currentIndex());
    owner_.setConnector(adapter);

    if (lstPorts_->topLevelItemCount() == 0) {
        LoadPropertySettings();
        return;
    }
    QTreeWidgetItem* item = lstPorts_->currentItem();
    if (!item || !item->isSelected()) {
        AddMessage(QStringLiteral("Select a COM port"));
        return;
    }
    const qint16 port = qint16(item->data(0, Qt::UserRole).toInt());
    AddMessage(QStringLiteral("Try COM%1").arg(port));
    QString error;
    if (!owner_.OpenCom(false, error)) {
        AddMessage(QStringLiteral("Error Closing COM%1 %2").arg(port).arg(error));
        return;
    }
    owner_.SetComPortID(port);
    if (owner_.OpenCom(true, error)) {
        AddMessage(QStringLiteral("Opening COM%1").arg(port));
        SaveProperty(KeyCommPort, port);
        SaveProperty(KeyConnector, adapter);
    } else {
        AddMessage(QStringLiteral("FAIL: ") + error);
        owner_.SetComPortID(previousPort);
        owner_.setConnector(previousConnector);
        SaveProperty(KeyCommPort, previousPort);
        SaveProperty(KeyComBuffer, previousConnector);
    }
}

void frmComSet::setBusy(bool busy) {
    probing_ = busy;
    for (QPushButton* button : cmdSet_)
        button->setEnabled(!busy);
}

void frmComSet::SetColour() {
    ApplyBaseColours(this);
}

void frmComSet::closeEvent(QCloseEvent* event) {
    // The port search runs inside this window's own call; it finishes first.
    if (probing_)
        event->ignore();
    else
        event->accept();
}

}  // namespace kv
