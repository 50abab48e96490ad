#ifndef MORVEL_MODALDRIVER_H
#define MORVEL_MODALDRIVER_H

#include <QApplication>
#include <QFileDialog>
#include <QList>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QTimer>

#include <functional>

// What a message box showed to the user.
struct SeenBox
{
    QString title;
    QString text;
    QString informativeText;
    QMessageBox::Icon icon = QMessageBox::NoIcon;
    QMessageBox::StandardButtons buttons;
    QMessageBox::StandardButton defaultButton = QMessageBox::NoButton;
};

// Plays the user's part in the modal windows a slot opens: each expected window, in order, is
// answered by one step. The windows run nested event loops, so a timer looks for them there.
class ModalDriver : public QObject
{
public:
    ModalDriver()
    {
        timer.setInterval(5);
        connect(&timer, &QTimer::timeout, this, &ModalDriver::poll);
        timer.start();
    }

    // Answers the next file dialog by choosing path, or by cancelling when path is empty.
    void chooseFile(const QString &path)
    {
        steps.append([this, path](QWidget *w) {
            auto *dialog = qobject_cast<QFileDialog *>(w);
            if (!dialog)
                return unexpected(w);
            dialogDirectories.append(dialog->directory().absolutePath());
            dialogCaptions.append(dialog->windowTitle());
            dialogFilters.append(dialog->nameFilters());
            if (path.isEmpty()) {
                dialog->reject();
            } else {
                dialog->selectFile(path);
                static_cast<QDialog *>(dialog)->accept(); // public in QDialog, runs QFileDialog::accept
            }
        });
    }

    // Answers the next message box with button, after running before (if given).
    void answerBox(QMessageBox::StandardButton button, std::function<void()> before = {})
    {
        steps.append([this, button, before](QWidget *w) {
            auto *box = qobject_cast<QMessageBox *>(w);
            if (!box)
                return unexpected(w);
            boxes.append(SeenBox{box->windowTitle(), box->text(), box->informativeText(), box->icon(),
                                 box->standardButtons(), box->standardButton(box->defaultButton())});
            if (before)
                before();
            if (QAbstractButton *b = box->button(button))
                b->click();
            else
                unexpected(w);
        });
    }

    bool allAnswered() const { return steps.isEmpty(); }

    QList<SeenBox> boxes;
    QStringList dialogDirectories;
    QStringList dialogCaptions;
    QList<QStringList> dialogFilters;
    QStringList problems;

private:
    void poll()
    {
        QWidget *w = QApplication::activeModalWidget();
        if (!w || !w->isVisible() || w == handled)
            return;
        handled = w;
        if (steps.isEmpty())
            return unexpected(w);
        const auto step = steps.takeFirst();
        step(w);
    }

    void unexpected(QWidget *w)
    {
        problems.append(QStringLiteral("unexpected window ") + QLatin1String(w->metaObject()->className()) + QLatin1Char(' ')
                        + w->windowTitle());
        if (auto *dialog = qobject_cast<QDialog *>(w))
            dialog->reject();
        else
            w->close();
    }

    QTimer timer;
    QPointer<QWidget> handled;
    QList<std::function<void(QWidget *)>> steps;
};

#endif
