#include "filedrop.h"
#include "import.h"

#include <QDir>
#include <QDropEvent>
#include <QFileInfo>
#include <QMimeData>
#include <QTimer>
#include <QUrl>

QString droppedFile(const QMimeData *data)
{
    const QList<QUrl> urls = data->urls();
    if (urls.size() != 1 || !urls.first().isLocalFile())
        return QString();
    const QString path = urls.first().toLocalFile();
    return QFileInfo(path).isFile() ? QDir::cleanPath(path) : QString();
}

FileDrop::FileDrop(Import *dialog)
    : QObject(dialog), dialog(dialog)
{
    dialog->setAcceptDrops(true);
    dialog->installEventFilter(this);
    // The log takes drops of its own (it is an editable text); files are the dialog's.
    dialog->importlog->viewport()->installEventFilter(this);
}

bool FileDrop::eventFilter(QObject *watched, QEvent *event)
{
    const QEvent::Type type = event->type();
    if (type != QEvent::DragEnter && type != QEvent::DragMove && type != QEvent::Drop)
        return QObject::eventFilter(watched, event);
    // QDragEnterEvent and QDragMoveEvent are drop events too.
    auto *drop = static_cast<QDropEvent *>(event);
    if (!drop->mimeData()->hasUrls())
        return false; // text dragged into the log stays the log's business
    const QString file = droppedFile(drop->mimeData());
    if (file.isEmpty() || !dialog->browseinput->isEnabled()) {
        drop->ignore();
        return true;
    }
    drop->acceptProposedAction();
    if (type == QEvent::Drop) {
        // The program the file came from waits for the drop to end: the file's message boxes
        // come after it.
        QTimer::singleShot(0, dialog, [d = dialog, file] { d->takeInputFile(file); });
    }
    return true;
}

void takeStartupFiles(Import &dialog, const QStringList &files)
{
    if (files.isEmpty())
        return;
    const QString first = files.first();
    const QString path = first.startsWith(QLatin1String("file:")) ? QUrl(first).toLocalFile() : first;
    dialog.takeInputFile(QDir::cleanPath(QFileInfo(path).absoluteFilePath()));
    if (files.size() > 1)
        dialog.importlog->append(QStringLiteral("Only the first file given on the command line is taken; left: ")
                                 + files.mid(1).join(QLatin1Char(' ')));
}
