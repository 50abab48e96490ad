#ifndef MORVEL_MODALDRIVER_H
#define MORVEL_MODALDRIVER_H

#include <QApplication>
#include <QElapsedTimer>
#include <QFileDialog>
#include <QMessageBox>
#include <QPointer>
#include <QPushButton>
#include <QTimer>

#include <functional>

// Plays the user's part in the modal windows a slot opens: each expected window, in order, is
// answered by one step. They run nested event loops, so a timer looks for them from there.
class ModalDriver : public QObject
{
public:
    ModalDriver()
    {
        connect(&timer, &QTimer::timeout, this, &ModalDriver::poll);
        timer.start(5);
    }

    // The next file dialog: choose path, or cancel when path is empty.
    void chooseFile(const QString &path)
    {
        steps.append([this, path](QWidget *w) {
            auto *dialog = qobject_cast<QFileDialog *>(w);
            if (!dialog)
                return unexpected(w);
            seen.append(dialog->windowTitle() + " | " + dialog->nameFilters().join(";;") + " | "
                        + dialog->directory().absolutePath());
            if (path.isEmpty())
                return dialog->reject();
            // Once its window is active, the name field has the keyboard focus, and the dialog
            // then leaves it as it is: the choice would not be taken and the dialog would stay
            // open. Whether the window is active by now depends on timing.
            if (QWidget *focused = dialog->focusWidget())
                focused->clearFocus();
            dialog->selectFile(path);
            static_cast<QDialog *>(dialog)->accept(); // public in QDialog, runs QFileDialog::accept
        });
    }

    // The next message box: run before (if any), then press button.
    void answerBox(QMessageBox::StandardButton button, std::function<void()> before = {})
    {
        steps.append([this, button, before](QWidget *w) {
            auto *box = qobject_cast<QMessageBox *>(w);
            if (!box || !box->button(button))
                return unexpected(w);
            seen.append(QStringList{box->windowTitle(), QString::number(box->icon()), box->text(), box->informativeText(),
                                    QString::number(box->standardButtons()),
                                    QString::number(box->standardButton(box->defaultButton()))}
                            .join(" | "));
            if (before)
                before();
            box->button(button)->click();
        });
    }

    bool allAnswered() const { return steps.isEmpty() && problems.isEmpty(); }

    QStringList seen; // one line per window, in order
    QStringList problems;

private:
    void poll()
    {
        QWidget *w = QApplication::activeModalWidget();
        if (!w || !w->isVisible())
            return;
        if (w == handled) {
            // A window that stays open after its answer (a refused choice) would hang the test.
            if (answeredAt.isValid() && answeredAt.elapsed() > 5000) {
                answeredAt.invalidate();
                problems.append(QLatin1String("still open after its answer: ") + w->metaObject()->className());
                if (auto *dialog = qobject_cast<QDialog *>(w))
                    dialog->reject();
            }
            return;
        }
        handled = w;
        answeredAt.start();
        if (steps.isEmpty())
            return unexpected(w);
        // Qt does not fire a timer again while its handler runs: a window the answer opens (the
        // file dialog's own "not found" box) is looked for by another timer, or the test hangs.
        QTimer nested;
        connect(&nested, &QTimer::timeout, this, &ModalDriver::poll);
        nested.start(5);
        steps.takeFirst()(w);
    }

    void unexpected(QWidget *w)
    {
        problems.append(QLatin1String("unexpected ") + w->metaObject()->className());
        if (auto *dialog = qobject_cast<QDialog *>(w))
            dialog->reject();
    }

    QTimer timer;
    QPointer<QWidget> handled;
    QElapsedTimer answeredAt;
    QList<std::function<void(QWidget *)>> steps;
};

#endif
