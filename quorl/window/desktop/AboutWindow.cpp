#include "quorl/window/desktop/AboutWindow.h"

#include <QCoreApplication>
#include <QDialogButtonBox>
#include <QTextBrowser>
#include <QVBoxLayout>

#include "quorl/window/desktop/Licences.h"

namespace quorl {

namespace {

constexpr QSize usualSize(360, 480);

QString linkTo(const char* licence) {
    return QStringLiteral("<a href=\"https://spdx.org/licenses/%1.html\">%1</a>")
        .arg(QString::fromLatin1(licence));
}

QString usedWorks() {
    QString works;
    for (const Licence& licence : licences()) {
        works +=
            QStringLiteral("<li>%1: %2</li>")
                .arg(QString::fromLatin1(licence.work).toHtmlEscaped(), linkTo(licence.identifier));
    }
    return works;
}

QString about() {
    return QStringLiteral("<h2>Velora</h2><p>%1</p><p>%2</p><p>%3</p><ul>%4</ul>")
        .arg(AboutWindow::tr("Version %1").arg(QCoreApplication::applicationVersion()),
             AboutWindow::tr("Chooses the music that goes to your Velora. Its licence is %1.")
                 .arg(linkTo(ownLicence)),
             AboutWindow::tr("It uses:"), usedWorks());
}

} // namespace

AboutWindow::AboutWindow(QWidget* parent) : QDialog(parent) {
    setAttribute(Qt::WA_DeleteOnClose);
    setWindowTitle(tr("About Velora"));
    auto* text = new QTextBrowser(this);
    text->setOpenExternalLinks(true);
    text->setHtml(about());
    text->setAccessibleName(windowTitle());
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close, this);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* column = new QVBoxLayout(this);
    column->addWidget(text, 1);
    column->addWidget(buttons);
    resize(usualSize.boundedTo(parent->window()->size()));
}

} // namespace quorl
