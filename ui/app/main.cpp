// The kv700 program: reads the command line, hands a file to an instance that
// is already running, or shows the main window.

#include "engine/app_settings.h"
#include "engine/diagnostics.h"
#include "engine/start_up.h"
#include "ui/app/demo_module.h"
#include "ui/app/open_files.h"
#include "ui/common/colour_palette.h"
#include "ui/hub/hub.h"
#include "ui/live/live_panel.h"

#include <QApplication>
#include <QFileInfo>

#include <cstdio>

int main(int argc, char* argv[]) {
    QApplication app(argc, argv);
    QApplication::setApplicationName(kv::SettingsApplication);
    QApplication::setApplicationVersion(QStringLiteral(KV700_VERSION));

    const kv::CommandLine command = kv::ParseCommandLine(app.arguments().mid(1));
    kv::SetDebugFlag(command.debug);
    const QString file =
        command.fileToOpen.isEmpty() ? QString() : QFileInfo(command.fileToOpen).absoluteFilePath();

    kv::OpenFilesServer openFiles;
    QString error;
    const kv::OpenFilesRole role = openFiles.listen(error);
    if (role == kv::OpenFilesRole::Second && !file.isEmpty()) {
        // The running program opens the file; this start ends whatever happens.
        if (!kv::SendFileToRunningInstance(file, error))
            qCWarning(lcEngine).noquote() << "Could not hand" << file << "over:" << error;
        return 0;
    }
    if (role == kv::OpenFilesRole::Unavailable)
        qCWarning(lcEngine).noquote() << "Files opened later will not reach this window:" << error;

    kv::DemoModule demo;
    if (command.demo && !demo.start(command.demoModel, error)) {
        std::fprintf(stderr, "kv700 --demo: %s\n", qPrintable(error));
        return 2;
    }

    kv::hub mainWindow;
    QObject::connect(&openFiles, &kv::OpenFilesServer::fileReceived, &mainWindow,
                     &kv::hub::ReceiveFile);
    auto* livePanel = new kv::LivePanel(mainWindow.connection());
    mainWindow.setLivePanel(livePanel);
    QObject::connect(&mainWindow, &kv::hub::colourThemeChanged, livePanel,
                     [livePanel](int theme) { livePanel->SetColour(kv::PaletteFor(theme)); });
    mainWindow.show();
    mainWindow.Load(file);
    livePanel->SetColour(kv::PaletteFor(kv::ColourTheme()));
    if (command.demo)
        mainWindow.overrideConnection(kv::DemoPort, kv::DemoConnector,
                                      QStringLiteral("Demo: simulated ") + demo.modelName());
    return app.exec();
}
