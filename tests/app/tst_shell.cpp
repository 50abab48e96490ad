#include "import.h"
#include "logbatch.h"
#include "testsupport.h"

#include <QDialog>
#include <QLabel>
#include <QPushButton>
#include <QTimer>
#include <QtTest>

class TestShell : public QObject
{
    Q_OBJECT

private slots:
    void aboutWindow_data();
    void aboutWindow();
    void aboutClosesByEscape();
    void closeButtonClearsAndCloses();
    void escapeClosesLikeClose();
    void longListsAreShortened_data();
    void longListsAreShortened();
};

namespace {
// The About window that help() runs modally, or null.
QDialog *openHelpWindow(QWidget *owner)
{
    for (QWidget *w : QApplication::topLevelWidgets()) {
        auto *dialog = qobject_cast<QDialog *>(w);
        if (dialog && dialog->isVisible() && dialog->windowTitle() == QLatin1String("Help")
            && dialog->parentWidget() == owner)
            return dialog;
    }
    return nullptr;
}
} // namespace

void TestShell::aboutWindow_data()
{
    QTest::addColumn<QByteArray>("versionFile"); // empty: no file
    QTest::addColumn<bool>("versionIsDirectory");
    QTest::addColumn<QString>("version");
    QTest::newRow("substitute version") << QByteArray() << false << "version unknown";
    QTest::newRow("read version") << QByteArray("Version : 3.0 beta\n") << false << "3.0 beta";
    QTest::newRow("unreadable version file") << QByteArray() << true << "";
}

void TestShell::aboutWindow()
{
    QFETCH(QByteArray, versionFile);
    QFETCH(bool, versionIsDirectory);
    QFETCH(QString, version);

    CurrentDirScope cwd;
    if (versionIsDirectory)
        QDir(cwd.path()).mkdir(QStringLiteral("version.txt"));
    else if (!versionFile.isEmpty())
        writeFile(cwd.file("version.txt"), versionFile);
    Import dialog;
    dialog.show();
    const QString logBefore = dialog.importlog->toHtml();

    QStringList texts;
    QString okText;
    bool linksOpen = false;
    bool seen = false;
    QTimer::singleShot(0, this, [&] {
        QDialog *help = openHelpWindow(&dialog);
        if (!help)
            return;
        seen = true;
        for (QLabel *label : help->findChildren<QLabel *>()) {
            texts << label->text();
            if (label->textFormat() == Qt::RichText)
                linksOpen = label->openExternalLinks();
        }
        auto *ok = help->findChild<QPushButton *>();
        okText = ok->text();
        ok->click();
    });
    dialog.help();

    QVERIFY(seen);
    QCOMPARE(texts.size(), 6);
    QCOMPARE(texts.count(QStringLiteral("<br>")), 3);
    QVERIFY(texts.contains(QStringLiteral("<b>Morvel2015 </b>") + version));
    QVERIFY(std::any_of(texts.cbegin(), texts.cend(),
                        [](const QString &t) { return t.contains(QLatin1String("<a href=\"https://")); }));
    QVERIFY(linksOpen);
    QCOMPARE(okText, QStringLiteral(" OK "));
    // The window is gone after the call and the log has not changed.
    QVERIFY(!openHelpWindow(&dialog));
    QVERIFY(dialog.findChildren<QDialog *>().isEmpty());
    QCOMPARE(dialog.importlog->toHtml(), logBefore);
}

void TestShell::aboutClosesByEscape()
{
    CurrentDirScope cwd;
    Import dialog;
    dialog.show();
    bool seen = false;
    QTimer::singleShot(0, this, [&] {
        if (QDialog *help = openHelpWindow(&dialog)) {
            seen = true;
            QTest::keyClick(help, Qt::Key_Escape);
        }
    });
    dialog.help();
    QVERIFY(seen);
    QVERIFY(dialog.isVisible());
}

void TestShell::closeButtonClearsAndCloses()
{
    CurrentDirScope cwd;
    Import dialog;
    dialog.show();
    QVERIFY(QTest::qWaitForWindowExposed(&dialog));
    dialog.inputpath->setText(QStringLiteral("/tmp/x.cif"));
    QVERIFY(!dialog.importlog->toPlainText().isEmpty());
    dialog.cancelButton->click();
    QVERIFY(dialog.inputpath->text().isEmpty());
    QVERIFY(dialog.importlog->toPlainText().isEmpty());
    QVERIFY(!dialog.isVisible());
}

void TestShell::escapeClosesLikeClose()
{
    CurrentDirScope cwd;
    Import dialog;
    dialog.setWindowFlags(Qt::Window);
    dialog.show();
    QVERIFY(QTest::qWaitForWindowExposed(&dialog));
    dialog.cancelButton->setFocus();
    QTest::keyClick(&dialog, Qt::Key_Escape);
    QVERIFY(!dialog.isVisible());
}

void TestShell::longListsAreShortened_data()
{
    QTest::addColumn<int>("count");
    QTest::addColumn<int>("paragraphs");
    QTest::newRow("short list whole") << 3 << 3;
    QTest::newRow("at the limit whole") << logListLimit << logListLimit;
    QTest::newRow("long list cut in the middle") << logListLimit + 5001 << logListLimit + 1;
}

void TestShell::longListsAreShortened()
{
    QFETCH(int, count);
    QFETCH(int, paragraphs);
    QStringList lines;
    for (int i = 0; i < count; ++i)
        lines << QStringLiteral("Atom%1  X  1").arg(i);
    QTextEdit log;
    appendLogLines(&log, lines);
    QStringList shown = logLines(&log);
    shown.removeAll(QString()); // the left-out line stands between two line breaks
    QCOMPARE(shown.size(), paragraphs);
    QCOMPARE(shown.first(), lines.first());
    QCOMPARE(shown.last(), lines.last());
    if (count > logListLimit)
        QCOMPARE(shown.at(logListLimit / 2),
                 QStringLiteral("%1 more lines are not shown in the log. ").arg(count - logListLimit));
}

QTEST_MAIN(TestShell)
#include "tst_shell.moc"
