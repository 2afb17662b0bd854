#include "gui/SoftwareUpdateWindow.h"

#include "update/SoftwareUpdateController.h"
#include "util/LocalizedStrings.h"

#include <QApplication>
#include <QFormLayout>
#include <QHBoxLayout>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QVBoxLayout>

namespace {

// A progress bar that keeps its place in the layout while hidden, so that nothing jumps.
QProgressBar* indicator(const char* name, bool busy) {
    auto* bar = new QProgressBar;
    bar->setObjectName(QLatin1String(name));
    bar->setRange(0, busy ? 0 : 100);
    bar->setTextVisible(!busy);
    QSizePolicy keepPlace = bar->sizePolicy();
    keepPlace.setRetainSizeWhenHidden(true);
    bar->setSizePolicy(keepPlace);
    bar->hide();
    return bar;
}

} // namespace

SoftwareUpdateWindow::SoftwareUpdateWindow(SoftwareUpdateController& updates, QWidget* parent)
    : QWidget(parent, Qt::Window),
      m_ourVersionField(new QLabel(SoftwareUpdateController::getOurVersionString())),
      m_currentVersionField(new QLabel(LocalizedStringNS("Not checked yet"))),
      m_checkVersionButton(new QPushButton(LocalizedStringNS("Check Now"))),
      m_progressIndicator(indicator("checkSpinner", true)), m_softwareUpdateField(new QLabel),
      m_softwareDownloadButton(new QPushButton(LocalizedStringNS("Download"))),
      m_downloadProgressIndicator(indicator("downloadProgress", false)) {
    setWindowTitle(LocalizedStringNS("Software Update"));
    // Closing it while the main window stays open must not end the application.
    setAttribute(Qt::WA_QuitOnClose, false);
    m_ourVersionField->setObjectName(QStringLiteral("ourVersion"));
    m_currentVersionField->setObjectName(QStringLiteral("currentVersion"));
    m_checkVersionButton->setObjectName(QStringLiteral("checkVersionButton"));
    m_softwareUpdateField->setObjectName(QStringLiteral("softwareUpdateStatus"));
    m_softwareUpdateField->setWordWrap(true);
    m_softwareUpdateField->setTextInteractionFlags(Qt::TextSelectableByMouse);
    m_softwareDownloadButton->setObjectName(QStringLiteral("downloadButton"));

    connect(m_checkVersionButton, &QPushButton::clicked, &updates,
            &SoftwareUpdateController::checkVersion);
    // One download at a time: the button waits for the one under way.
    connect(m_softwareDownloadButton, &QPushButton::clicked, &updates, [this, &updates] {
        m_softwareDownloadButton->setEnabled(false);
        updates.clickSoftwareUpdateButton();
    });
    connect(&updates, &SoftwareUpdateController::statusChanged, m_softwareUpdateField,
            &QLabel::setText);
    connect(&updates, &SoftwareUpdateController::currentVersionChanged, m_currentVersionField,
            &QLabel::setText);
    connect(&updates, &SoftwareUpdateController::checkBusyChanged, m_progressIndicator,
            &QWidget::setVisible);
    connect(&updates, &SoftwareUpdateController::downloadProgressChanged, this,
            [this](bool visible, double percent) {
                m_downloadProgressIndicator->setValue(qRound(percent));
                m_downloadProgressIndicator->setVisible(visible);
            });
    // A download that cannot even start is told by a beep, as the log says why.
    connect(&updates, &SoftwareUpdateController::downloadFinished, this,
            [this](bool ok, const QString& path) {
                m_softwareDownloadButton->setEnabled(true);
                if (!ok && path.isEmpty())
                    QApplication::beep();
            });

    auto* versions = new QFormLayout;
    versions->addRow(LocalizedStringNS("Your version:"), m_ourVersionField);
    versions->addRow(LocalizedStringNS("Published version:"), m_currentVersionField);
    auto* check = new QHBoxLayout;
    check->addWidget(m_checkVersionButton);
    check->addWidget(m_progressIndicator, 1);
    auto* download = new QHBoxLayout;
    download->addWidget(m_softwareDownloadButton);
    download->addWidget(m_downloadProgressIndicator, 1);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(versions);
    layout->addLayout(check);
    layout->addWidget(m_softwareUpdateField);
    layout->addStretch(1);
    layout->addLayout(download);
    resize(420, 220);
}
