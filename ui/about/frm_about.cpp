#include "ui/about/frm_about.h"

#include "ui/common/colour_palette.h"

#include <QTextBrowser>
#include <QVBoxLayout>

namespace kv {

QString AboutText() {
    return QStringLiteral(R"(
<h2>KV700 PC Programmer</h2>
<p>Configures, programs and calibrates KV714, KV716, KV718, KV720 and KV760
signal-conditioning modules through a programming adapter on a serial port.</p>

<h3>Getting connected</h3>
<ol>
<li>Plug the adapter in and put the module on it.</li>
<li>Press <b>Settings</b> on the tool bar. The window lists every COM port found and
the module that answered on it. Choose the port and the adapter type, then press
<b>Connect</b>.</li>
<li>The program reads the module's type, ranges and registers; the status line at the
bottom shows each step and ends with <i>Run Mode</i>. From then on the module's live
values are shown above the tabs.</li>
</ol>
<p>The two buttons <b>Connect to module</b> and <b>Close COM</b> at the top connect to
and disconnect from the module on the port chosen last. The program connects by itself
when it starts, unless it was started to open a file.</p>

<h3>Tool bar</h3>
<table cellspacing="0" cellpadding="4">
<tr><td><b>Open File</b></td><td>Loads a saved settings file (<tt>.kv7</tt>) into a new
tab, ready to be written into a module.</td></tr>
<tr><td><b>Read Module</b></td><td>Reads the settings of the connected module into a new
tab. Wait for <i>Run Mode</i> before using it.</td></tr>
<tr><td><b>User Guide</b></td><td>Opens the adapter's user guide (a PDF document next to
the program).</td></tr>
<tr><td><b>Settings</b></td><td>Disconnects and opens the connection settings: COM port,
adapter type and colour theme.</td></tr>
<tr><td><b>Close Tab</b></td><td>Closes the settings tab you are looking at. This page
and the debug log cannot be closed.</td></tr>
</table>

<h3>Tabs</h3>
<p>Every file you open and every module you read gets its own tab, so you can keep
several sets of settings side by side. In a settings tab you can read the connected
module, write the settings into it, save them to a file, and calibrate.</p>
<p>While the program is talking to the module it cannot switch tabs or start another
command; the status line then says <i>Try again later !!</i> or
<i>Please try again !!</i>. Wait a moment and repeat the click.</p>

<h3>Opening files from the desktop</h3>
<p>Opening a <tt>.kv7</tt> file while the program is already running hands the file to
the running program, which disconnects and shows the file in a new tab.</p>

<h3>Trying it without hardware</h3>
<p>Start the program with <tt>--demo</tt> (optionally followed by a model such as
<tt>KV720-20</tt>) to connect to a simulated module.</p>
)");
}

frmAbout::frmAbout(QWidget* parent)
    : TabWindow(QStringLiteral("About"), parent), txtAbout_(new QTextBrowser(this)) {
    txtAbout_->setObjectName(QStringLiteral("txtAbout"));
    txtAbout_->setOpenExternalLinks(false);
    txtAbout_->setFrameShape(QFrame::NoFrame);
    txtAbout_->setHtml(AboutText());
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(12, 8, 12, 8);
    layout->addWidget(txtAbout_);
    SetColour();
}

void frmAbout::SetColour() {
    ApplyBaseColours(this);
}

}  // namespace kv
