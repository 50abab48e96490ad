#include "filedrop.h"
#include "import.h"

#include <QApplication>
#include <QIcon>
#include <QTimer>
#include <cstdio>
#include <cstdlib>

int main(int argc, char *argv[])
{
#if defined(Q_OS_UNIX) && !defined(Q_OS_MACOS)
    // Without a display Qt aborts with a platform-plugin message that tells a user little.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM") && qEnvironmentVariableIsEmpty("DISPLAY")
        && qEnvironmentVariableIsEmpty("WAYLAND_DISPLAY")) {
        std::fprintf(stderr,
                     "MorvelGUI: no display is available (neither DISPLAY nor WAYLAND_DISPLAY is set).\n"
                     "Start it from a desktop session, or on a virtual display with: xvfb-run -a MorvelGUI\n");
        return 1;
    }
#endif
    QApplication app(argc, argv);
#ifndef Q_OS_WIN
    // Windows takes the icon from the executable's resource; elsewhere it is set from the Qt resource.
    app.setWindowIcon(QIcon(QStringLiteral(":/icons/morvelgui.png")));
#endif
    Import dialog;
    dialog.setWindowFlags(Qt::Window);
    // The form's sizes were drawn for a small Windows font; with a larger desktop font the window
    // grows so that no label is cut.
    dialog.resize(dialog.size().expandedTo(dialog.sizeHint()));
    dialog.show();
    // A file given on the command line (a file manager's "Open with") is taken once the window is up.
    const QStringList files = app.arguments().mid(1);
    QTimer::singleShot(0, &dialog, [&dialog, files] { takeStartupFiles(dialog, files); });
    return app.exec();
}
