#include "import.h"
#include "toolconfiguration.h"

#include <QDialog>
#include <QFont>
#include <QLabel>
#include <QPushButton>
#include <QVBoxLayout>

namespace {
const char projectAddress[] = "https://www.morvelgui.org";
const char authorLine[] = "MorvelGUI developers";
} // namespace

void Import::help()
{
    QFont font;
    font.setPointSize(12);

    const QString emptyLine = QStringLiteral("<br>");
    const QString title = QStringLiteral("<b>Morvel2015 </b>") + shownVersion(versionText);
    const QString author = QString::fromLatin1(authorLine);
    const QString address = QString::fromLatin1(projectAddress);
    const QString link = QStringLiteral("<a href=\"") + address + QStringLiteral("\">") + address
                         + QStringLiteral("</a>");

    QDialog window(this);
    window.setWindowTitle(QStringLiteral("Help"));
    auto *layout = new QVBoxLayout(&window);

    auto *empty1 = new QLabel(emptyLine, &window);
    auto *empty2 = new QLabel(emptyLine, &window);
    auto *empty3 = new QLabel(emptyLine, &window);
    auto *titleLabel = new QLabel(title, &window);
    auto *authorLabel = new QLabel(author, &window);
    authorLabel->setTextFormat(Qt::PlainText);
    auto *linkLabel = new QLabel(&window);

    titleLabel->setAlignment(Qt::AlignHCenter);
    authorLabel->setAlignment(Qt::AlignHCenter);
    linkLabel->setAlignment(Qt::AlignHCenter);
    titleLabel->setFont(font);
    authorLabel->setFont(font);

    linkLabel->setTextFormat(Qt::RichText);
    linkLabel->setFont(font);
    linkLabel->setOpenExternalLinks(true);
    linkLabel->setText(link);

    auto *ok = new QPushButton(QStringLiteral(" OK "), &window);

    layout->addWidget(empty1);
    layout->addWidget(titleLabel);
    layout->addWidget(authorLabel);
    layout->addWidget(empty2);
    layout->addWidget(linkLabel);
    layout->addWidget(empty3);
    layout->addWidget(ok);

    connect(ok, &QPushButton::clicked, &window, &QDialog::close);
    window.exec();
}
