#include "logwindow.h"

#include <QBuffer>
#include <QFile>
#include <QFileInfo>
#include <QImage>
#include <QTextDocument>
#include <QTextEdit>
#include <QUrl>

void appendLogGroups(QTextEdit *log, const LogGroups &groups)
{
    const qsizetype half = logGroupLimit / 2;
    for (const QStringList &lines : groups) {
        const bool shortened = lines.size() > logGroupLimit;
        for (qsizetype i = 0; i < lines.size(); ++i) {
            if (shortened && i == half) {
                log->append(LogStyle::error(QLatin1Char(' ') + QString::number(lines.size() - 2 * half)
                                            + QStringLiteral(" more lines are not shown in the log. ")));
                i = lines.size() - half;
            }
            log->append(lines.at(i));
        }
    }
}

QVariant logResource(int type, const QUrl &url)
{
    // A path, or a file: URL, as Qt would read it (a relative one against the current directory).
    const QString path = url.isLocalFile() ? url.toLocalFile() : url.scheme().isEmpty() ? url.path() : QString();
    const QFileInfo info(path);
    if (!path.isEmpty() && info.isFile() && info.size() <= markupFileLimit) {
        QFile file(path);
        if (file.open(QIODevice::ReadOnly))
            return file.read(markupFileLimit);
    }
    if (type != QTextDocument::ImageResource)
        return QByteArray();
    // A valid image: given nothing, Qt's image handler would read the file by itself.
    static const QByteArray blank = [] {
        QImage image(1, 1, QImage::Format_ARGB32);
        image.fill(Qt::transparent);
        QByteArray png;
        QBuffer buffer(&png);
        buffer.open(QIODevice::WriteOnly);
        image.save(&buffer, "PNG");
        return png;
    }();
    return blank;
}

namespace {
class LogDocument : public QTextDocument
{
public:
    using QTextDocument::QTextDocument;

protected:
    QVariant loadResource(int type, const QUrl &name) override
    {
        if (name.scheme().compare(QLatin1String("data"), Qt::CaseInsensitive) == 0)
            return QTextDocument::loadResource(type, name);
        return logResource(type, name);
    }
};
} // namespace

void guardLogResources(QTextEdit *log)
{
    auto *document = new LogDocument(log);
    document->setDefaultFont(log->document()->defaultFont());
    log->setDocument(document);
}
