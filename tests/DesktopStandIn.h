#pragma once

#include <QDesktopServices>
#include <QObject>
#include <QUrl>

// While it lives, file URLs that QDesktopServices would open are handed to it instead.
class DesktopStandIn : public QObject {
    Q_OBJECT

public:
    DesktopStandIn() { QDesktopServices::setUrlHandler("file", this, "open"); }
    ~DesktopStandIn() override { QDesktopServices::unsetUrlHandler("file"); }
    QList<QUrl> opened;

public Q_SLOTS:
    void open(const QUrl& url) { opened += url; }
};
