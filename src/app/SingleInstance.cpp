#include "app/SingleInstance.h"

#include <QDataStream>
#include <QDir>
#include <QLocalServer>
#include <QLocalSocket>
#include <QRegularExpression>
#include <QStandardPaths>

SingleInstance::SingleInstance(QObject* parent)
    : QObject(parent), m_server(new QLocalServer(this)) {
    connect(m_server, &QLocalServer::newConnection, this, &SingleInstance::accept);
}

QString SingleInstance::socketPath() {
    // Each display (an X11 one, a Wayland one) has its own Pelmo.
    QString display = qEnvironmentVariable("WAYLAND_DISPLAY", qEnvironmentVariable("DISPLAY"));
    display.replace(QRegularExpression(QStringLiteral("[^A-Za-z0-9._-]")), QStringLiteral("_"));
    return QStandardPaths::writableLocation(QStandardPaths::RuntimeLocation) +
           QStringLiteral("/pelmo") + (display.isEmpty() ? QString() : '-' + display) +
           QStringLiteral(".socket");
}

SingleInstance::HandOver SingleInstance::handOver(const QString& link,
                                                  std::chrono::milliseconds timeout) {
    QLocalSocket socket;
    socket.connectToServer(socketPath());
    if (!socket.waitForConnected(int(timeout.count())))
        return HandOver::NoneRunning;
    QDataStream out(&socket);
    out << link;
    socket.flush();
    while (socket.bytesAvailable() < 1)
        if (!socket.waitForReadyRead(int(timeout.count())))
            return HandOver::NoAnswer;
    return HandOver::Taken;
}

bool SingleInstance::listen() {
    // Only a socket nobody answered on is removed: callers asked handOver() first, under the lock.
    QLocalServer::removeServer(socketPath());
    m_server->setSocketOptions(QLocalServer::UserAccessOption);
    if (!m_server->listen(socketPath()))
        return false;
    m_state = State::Listening;
    return true;
}

void SingleInstance::accept() {
    while (QLocalSocket* socket = m_server->nextPendingConnection()) {
        connect(socket, &QLocalSocket::disconnected, socket, &QObject::deleteLater);
        connect(socket, &QLocalSocket::readyRead, this, [this, socket] {
            QDataStream in(socket);
            in.startTransaction();
            QString link;
            in >> link;
            if (!in.commitTransaction())
                return;
            Q_EMIT received(link);
            socket->write("1", 1);
            socket->disconnectFromServer();
        });
    }
}
