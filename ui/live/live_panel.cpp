#include "ui/live/live_panel.h"

#include "engine/diagnostics.h"
#include "engine/module_connection.h"
#include "ui/live/indicator_lamp.h"
#include "ui/live/live_display.h"
#include "ui/live/remote_output.h"

#include <QApplication>
#include <QGridLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

namespace kv {

namespace {

const QString hubTag = QStringLiteral("hub");

// Relative font sizes, so the panel scales with the user's font and screen.
constexpr qreal ValueScale = 2.0;
constexpr qreal HeadingScale = 1.15;

QLabel* label(const char* role, QWidget* parent) {
    auto* text = new QLabel(parent);
    text->setProperty("role", QLatin1String(role));
    text->setTextInteractionFlags(Qt::TextSelectableByMouse);
    return text;
}

QLabel* heading(QWidget* parent) {
    QLabel* text = label("heading", parent);
    QFont font = text->font();
    font.setBold(true);
    font.setPointSizeF(font.pointSizeF() * HeadingScale);
    text->setFont(font);
    return text;
}

QLabel* valueLabel(QWidget* parent) {
    QLabel* text = label("value", parent);
    QFont font = text->font();
    font.setBold(true);
    font.setPointSizeF(font.pointSizeF() * ValueScale);
    text->setFont(font);
    // Room for the widest value a module reports, so the cards keep their width. A fixed
    // size also keeps a new reading from re-laying out the whole window several times a second.
    const QFontMetrics metrics(font);
    text->setFixedSize(metrics.horizontalAdvance(QStringLiteral("-0000.00 mAac")),
                       metrics.height());
    return text;
}

// Shows a value; a text wider than the label widens it once instead of being cut.
void setValue(QLabel* label, const QString& value) {
    const int needed = label->fontMetrics().horizontalAdvance(value);
    if (needed > label->width())
        label->setFixedWidth(needed);
    label->setText(value);
}

QLabel* errorLabel(QWidget* parent) {
    QLabel* text = label("error", parent);
    QFont font = text->font();
    font.setBold(true);
    text->setFont(font);
    text->setMinimumHeight(QFontMetrics(font).height());
    return text;
}

QLabel* summaryLabel(QWidget* parent) {
    QLabel* text = label("summary", parent);
    text->setWordWrap(true);
    text->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    text->setMinimumHeight(QFontMetrics(text->font()).lineSpacing() * 3);
    return text;
}

QFrame* card(const QString& name, QWidget* parent) {
    auto* frame = new QFrame(parent);
    frame->setObjectName(name);
    frame->setProperty("card", true);
    return frame;
}

QHBoxLayout* headingRow(QLabel* title, std::initializer_list<QWidget*> right) {
    auto* row = new QHBoxLayout;
    row->addWidget(title);
    row->addStretch();
    for (QWidget* widget : right)
        row->addWidget(widget);
    return row;
}

// Module texts separate lines with CRLF.
QString shown(const QString& text) {
    QString lines = text;
    return lines.replace(QStringLiteral("\r\n"), QStringLiteral("\n"));
}

QString rgb(const QColor& colour) {
    return colour.name(QColor::HexRgb);
}

}  // namespace

LivePanel::LivePanel(ModuleConnection& connection, QWidget* parent)
    : QFrame(parent), connection_(connection) {
    setObjectName(QStringLiteral("picContain"));
    setToolTip(QStringLiteral("The output value displayed is a projected value that can oly be "
                              "achieve if connected correctly and within specified range."));

    auto* cards = new QHBoxLayout;
    cards->setSpacing(8);
    cards->addWidget(buildInput(), 3);
    cards->addWidget(buildOutput(0), 3);
    cards->addWidget(buildOutput(1), 3);
    cards->addWidget(buildIdentity(), 1);

    labAboutOutputs_ = label("note", this);
    labAboutOutputs_->setObjectName(QStringLiteral("labAboutOutputs"));
    labAboutOutputs_->setWordWrap(true);
    labAboutOutputs_->setText(QStringLiteral("Output values displayed are projected values that "
                                             "are achieve if connected correctly and within "
                                             "specified range."));

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(8, 8, 8, 6);
    layout->setSpacing(4);
    layout->addLayout(cards);
    layout->addWidget(labAboutOutputs_);
    // Taller than its contents the panel would only add blank card space.
    layout->addStretch(1);
    setSizePolicy(QSizePolicy::Preferred, QSizePolicy::Maximum);

    connect(&connection.engine(), &RequestEngine::registerStored, this, &LivePanel::KV700Display);
    connect(&connection, &ModuleConnection::moduleControlsChanged, this,
            [this] { ShowModuleControls(ModuleMap); });

    ShowModuleControls(ModuleMap);
    SetColour(colours_);
}

QFrame* LivePanel::buildInput() {
    InputWidgets& w = input_;
    w.picInput = card(QStringLiteral("picInput"), this);
    w.labInput = heading(w.picInput);
    w.labResponce1 = label("response", w.picInput);
    w.labResponce1->setToolTip(QStringLiteral("Response or input filter"));
    w.inLo = new IndicatorLamp(QStringLiteral("LOW"), w.picInput);
    w.inLo->setToolTip(QStringLiteral("Input low; pulses while readings arrive"));
    w.inHi = new IndicatorLamp(QStringLiteral("HIGH"), w.picInput);
    w.inHi->setToolTip(QStringLiteral("Input high"));
    w.labInputValue = valueLabel(w.picInput);
    w.labInputError = errorLabel(w.picInput);
    w.labCusValInput = summaryLabel(w.picInput);
    w.labInputValue->setObjectName(QStringLiteral("labInputValue"));
    w.labInputError->setObjectName(QStringLiteral("labInputError"));
    w.labCusValInput->setObjectName(QStringLiteral("labCusValInput"));

    auto* layout = new QVBoxLayout(w.picInput);
    layout->addLayout(headingRow(w.labInput, {w.labResponce1, w.inLo, w.inHi}));
    layout->addWidget(w.labInputValue);
    layout->addWidget(w.labInputError);
    layout->addWidget(w.labCusValInput, 1);
    return w.picInput;
}

QFrame* LivePanel::buildOutput(int channel) {
    OutputWidgets& w = outputs_[channel];
    w.picOutput = card(QStringLiteral("picOutput%1").arg(channel), this);
    w.labOutput = heading(w.picOutput);
    w.outLo = new IndicatorLamp(QStringLiteral("LOW"), w.picOutput);
    w.outLo->setToolTip(QStringLiteral("Below the low limit"));
    w.outHi = new IndicatorLamp(QStringLiteral("HIGH"), w.picOutput);
    w.outHi->setToolTip(QStringLiteral("Above the high limit"));
    w.labOutputValue = valueLabel(w.picOutput);
    w.labOutputError = errorLabel(w.picOutput);
    w.labCusValOutput = summaryLabel(w.picOutput);
    w.labOutputValue->setObjectName(QStringLiteral("labOutputValue%1").arg(channel));
    w.labOutputError->setObjectName(QStringLiteral("labOutputError%1").arg(channel));
    w.labCusValOutput->setObjectName(QStringLiteral("labCusValOutput%1").arg(channel));

    w.remoteRow = new QWidget(w.picOutput);
    // The card keeps its height when the output goes in or out of remote control.
    QSizePolicy keep = w.remoteRow->sizePolicy();
    keep.setRetainSizeWhenHidden(true);
    w.remoteRow->setSizePolicy(keep);
    w.txtRemoteSet = new QLineEdit(w.remoteRow);
    w.txtRemoteSet->setPlaceholderText(QStringLiteral("Output value"));
    w.txtRemoteSet->setToolTip(QStringLiteral("Forces the output to this value (its units)"));
    w.cmdRemote = new QPushButton(QStringLiteral("Send"), w.remoteRow);
    w.cmdRemote->setAutoFillBackground(true);
    auto* remote = new QHBoxLayout(w.remoteRow);
    remote->setContentsMargins(0, 0, 0, 0);
    QLabel* caption = label("caption", w.remoteRow);
    caption->setText(QStringLiteral("Remote"));
    remote->addWidget(caption);
    remote->addWidget(w.txtRemoteSet, 1);
    remote->addWidget(w.cmdRemote);
    connect(w.cmdRemote, &QPushButton::clicked, this,
            [this, channel] { cmdRemote_Click(channel); });
    connect(w.txtRemoteSet, &QLineEdit::textChanged, this,
            [this, channel] { cmdRemote_Click(channel); });

    auto* layout = new QVBoxLayout(w.picOutput);
    layout->addLayout(headingRow(w.labOutput, {w.outLo, w.outHi}));
    layout->addWidget(w.labOutputValue);
    layout->addWidget(w.labOutputError);
    layout->addWidget(w.labCusValOutput, 1);
    layout->addWidget(w.remoteRow);
    return w.picOutput;
}

QFrame* LivePanel::buildIdentity() {
    QFrame* frame = card(QStringLiteral("picIdentity"), this);
    auto* layout = new QGridLayout(frame);
    QLabel* title = heading(frame);
    title->setText(QStringLiteral("Module"));
    layout->addWidget(title, 0, 0, 1, 2);
    const char* captions[] = {"Serial No", "Revision", "Bus ID", "Int Temp"};
    for (int row = 0; row < 4; ++row) {
        QLabel* caption = label("caption", frame);
        caption->setText(QLatin1String(captions[row]));
        labValue_[row] = label("identity", frame);
        QFont font = labValue_[row]->font();
        font.setBold(true);
        labValue_[row]->setFont(font);
        layout->addWidget(caption, row + 1, 0);
        layout->addWidget(labValue_[row], row + 1, 1);
    }
    layout->setColumnStretch(1, 1);
    layout->setRowStretch(5, 1);
    return frame;
}

void LivePanel::KV700Display(qint32 address) {
    kv::KV700Display(view_, LiveSource::Program(), address);
    render();
}

void LivePanel::ShowModuleControls(int map) {
    const bool wasActive = view_.active;
    kv::ShowModuleControls(view_, map);
    if (wasActive != view_.active)
        applyStyle();
    render();
}

void LivePanel::SetColour(const ColourPalette& colours) {
    colours_ = colours;
    applyStyle();
    render();
}

QLineEdit* LivePanel::txtRemoteSet(int channel) const {
    return outputs_[channel].txtRemoteSet;
}

QPushButton* LivePanel::cmdRemote(int channel) const {
    return outputs_[channel].cmdRemote;
}

bool LivePanel::remoteRefused(int channel) const {
    return outputs_[channel].refused;
}

void LivePanel::cmdRemote_Click(int channel) {
    const RemoteRequest request =
        RemoteOutputRequest(LiveSource::Program(), channel, txtRemoteSet(channel)->text());
    QString error;
    if (request.accepted && connection_.engine().W_DelayCB(qint16(request.address), request.count,
                                                           ValueLong, hubTag, CallbackHub, error)) {
        setRemoteRefused(channel, false);
        return;
    }
    const QString status = request.accepted ? QStringLiteral("Remote ") + error : request.refusal;
    ShowStatus(status);
    AddMessage(status);
    ShowRemoteRefusal(view_, request);
    setRemoteRefused(channel, true);
    render();
}

void LivePanel::setRemoteRefused(int channel, bool refused) {
    OutputWidgets& w = outputs_[channel];
    w.refused = refused;
    QPalette palette = w.cmdRemote->palette();
    palette.setColor(QPalette::Button,
                     refused ? colours_.alarm : QApplication::palette().color(QPalette::Button));
    w.cmdRemote->setPalette(palette);
}

void LivePanel::render() {
    const InputView& in = view_.input;
    input_.labInput->setText(in.heading);
    setValue(input_.labInputValue, in.value);
    input_.labCusValInput->setText(shown(in.summary));
    input_.labInputError->setText(in.error);
    input_.labResponce1->setText(in.response);
    const Rgb pulse = PulseColour(in.pulseColour);
    switch (in.low) {
    case Lamp::Off:
        input_.inLo->setOff();
        break;
    case Lamp::Alarm:
        input_.inLo->setLit(colours_.alarm, QStringLiteral("LOW"));
        break;
    case Lamp::Pulse:
        input_.inLo->setLit(QColor(pulse.red, pulse.green, pulse.blue), QStringLiteral("LIVE"));
        break;
    }
    if (in.high == Lamp::Off)
        input_.inHi->setOff();
    else
        input_.inHi->setLit(colours_.alarm, QStringLiteral("HIGH"));

    for (int channel = 0; channel < 2; ++channel) {
        const OutputView& out = view_.outputs[channel];
        OutputWidgets& w = outputs_[channel];
        w.picOutput->setVisible(out.visible);
        w.labOutput->setText(out.heading);
        setValue(w.labOutputValue, out.value);
        w.labCusValOutput->setText(shown(out.summary));
        w.labOutputError->setText(out.error);
        for (auto [lamp, state, text] :
             {std::tuple{w.outLo, out.low, "LOW"}, std::tuple{w.outHi, out.high, "HIGH"}}) {
            if (state == Lamp::Off)
                lamp->setOff();
            else
                lamp->setLit(colours_.alarm, QLatin1String(text));
        }
        w.remoteRow->setVisible(out.remote);
    }

    const IdentityView& id = view_.identity;
    const QString values[] = {id.serial, id.revision.trimmed(), id.busId, id.temperature};
    for (int row = 0; row < 4; ++row)
        labValue_[row]->setText(values[row]);
}

void LivePanel::applyStyle() {
    const QColor cardColour = view_.active ? colours_.white : colours_.panel;
    const QColor inactiveText(128, 128, 128);
    const QColor textColour = view_.active ? colours_.text : inactiveText;
    const QColor headingColour = view_.active ? colours_.themeAccent : inactiveText;
    setStyleSheet(QStringLiteral("QFrame#picContain { background: %1; }"
                                 "QFrame[card=\"true\"] { background: %2; border: 1px solid %3;"
                                 " border-radius: 6px; }"
                                 "QLabel { background: transparent; color: %4; }"
                                 "QLabel[role=\"heading\"] { color: %5; }"
                                 "QLabel[role=\"error\"] { color: %6; }"
                                 "QLabel[role=\"summary\"], QLabel[role=\"caption\"],"
                                 " QLabel[role=\"note\"] { color: %7; }"
                                 "QLabel[role=\"response\"] { color: %8; font-weight: bold; }")
                      .arg(rgb(colours_.face), rgb(cardColour), rgb(colours_.panel.darker(115)),
                           rgb(textColour), rgb(headingColour), rgb(colours_.alarm),
                           rgb(QColor(80, 80, 80)), rgb(colours_.highlight)));
    for (IndicatorLamp* lamp : {input_.inLo, input_.inHi, outputs_[0].outLo, outputs_[0].outHi,
                                outputs_[1].outLo, outputs_[1].outHi})
        lamp->setOutline(colours_.panel.darker(120));
}

}  // namespace kv
