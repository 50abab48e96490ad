// Prints where the controls a demo job needs lie inside the MorvelGUI window, one line each:
//   window <width> <height>
//   <objectName> <x> <y>      (centre, in window coordinates)
// It builds the window as the program's main() does and shows it on the same display, so the
// layout (fonts, DPI, style) is the one the real program gets there. scripts/desktop-check.sh
// clicks these points with xdotool.
#include "import.h"

#include <QApplication>
#include <QTimer>

#include <cstdio>

int main(int argc, char *argv[])
{
    QApplication app(argc, argv);
    Import dialog;
    dialog.setWindowFlags(Qt::Window);
    dialog.resize(dialog.size().expandedTo(dialog.sizeHint()));
    dialog.show();

    QTimer::singleShot(200, &app, [&] {
        std::printf("window %d %d\n", dialog.width(), dialog.height());
        const QList<QWidget *> controls{dialog.browseinput, dialog.importButton, dialog.InputBox,
                                        dialog.importlog};
        for (QWidget *w : controls) {
            const QPoint centre = w->mapTo(&dialog, w->rect().center());
            std::printf("%s %d %d\n", qPrintable(w->objectName()), centre.x(), centre.y());
        }
        std::fflush(stdout);
        app.quit();
    });
    return app.exec();
}
