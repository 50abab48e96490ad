// Prints where the controls a demo job needs lie in the MorvelGUI window ("window <width> <height>",
// then "<objectName> <x> <y>" of each centre), laid out as main() does it on this display, for
// scripts/desktop-check.sh to click with xdotool.
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
        for (QWidget *w : std::initializer_list<QWidget *>{dialog.browseinput, dialog.importButton, dialog.InputBox, dialog.importlog}) {
            const QPoint centre = w->mapTo(&dialog, w->rect().center());
            std::printf("%s %d %d\n", qPrintable(w->objectName()), centre.x(), centre.y());
        }
        std::fflush(stdout);
        app.quit();
    });
    return app.exec();
}
