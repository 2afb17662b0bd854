#pragma once

#include <QDesktopServices>
#include <QObject>
#include <QUrl>

// Stands in for the desktop while it lives: QDesktopServices hands file URLs to it instead of
// opening them.
class DesktopStandIn : public QObject {
    Q_OBJECT

public:
    DesktopStandIn() { QDesktopServices::setUrlHandler("file", this, "open"); }
    ~DesktopStandIn() override { QDesktopServices::unsetUrlHandler("file"); }
    QList<QUrl> opened;

public Q_SLOTS:
    void open(const QUrl& url) { opened += url; }
};
