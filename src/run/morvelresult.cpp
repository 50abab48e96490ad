#include "import.h"
#include "logstyle.h"
#include "runlogic.h"

#include <QFile>
#include <QProcess>
#include <QTextBlock>
#include <QTextDocument>

namespace {
// Whether the document names an anchor "TITLE" from the paragraph at position on.
bool hasTitleAnchor(const QTextDocument *document, int position)
{
    for (QTextBlock block = document->findBlock(position); block.isValid(); block = block.next()) {
        for (auto fragment = block.begin(); !fragment.atEnd(); ++fragment) {
            if (fragment.fragment().charFormat().anchorNames().contains(QLatin1String("TITLE")))
                return true;
        }
    }
    return false;
}
} // namespace

void Import::checkStartMorvel()
{
    importlog->append(QStringLiteral("<br>-->  Starting Morvel ..."));
}

void Import::endMorvel(int exitCode)
{
    updateButtons();
    if (exitCode != 0)
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong with morvel program ! ")));

    // Opened read-write like every file here: a missing result is created and shown empty.
    QFile result(workingDir + QStringLiteral("/MORVEL.OUT"));
    if (!result.open(QIODevice::ReadWrite)) {
        importlog->append(LogStyle::error(QStringLiteral(" Something went wrong while opening a \"morvel.out\" file! ")));
        return;
    }

    importlog->append(QStringLiteral(" "));
    importlog->append(QStringLiteral(" "));
    for (const QString &line : resultBanner())
        importlog->append(line);

    // One append of the whole text, or of the beginning of a very large one: the file itself is
    // never cut, and the editor shows all of it.
    const ResultText shown = readResultText(result);
    const int start = importlog->document()->characterCount() - 1;
    importlog->append(shown.text);
    if (!shown.whole)
        importlog->append(resultTooLargeLine(shown.fileSize));
    // Without the anchor the view stays where the append left it, instead of going to the top.
    if (hasTitleAnchor(importlog->document(), start))
        importlog->scrollToAnchor(QStringLiteral("TITLE"));
}

void Import::openMorvelOut()
{
    const QString path = workingDir + QStringLiteral("/MORVEL.OUT");
    if (!QFile::exists(path)) {
        importlog->append(LogStyle::error(QStringLiteral(" There is no MORVEL.OUT file in the current directory! ")));
        return;
    }
    const QString editor = textEditorProgram();
    if (!editor.isEmpty())
        QProcess::startDetached(editor, {path});
}
