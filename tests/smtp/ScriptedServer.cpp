#include "ScriptedServer.h"

#include <QHostAddress>
#include <QTimer>

#include <chrono>

ScriptedServer::ScriptedServer() {
    m_server.listen(QHostAddress::LocalHost);
    connect(&m_server, &QTcpServer::newConnection, this, &ScriptedServer::onConnection);
}

void ScriptedServer::answer(const QByteArray& prefix, const QByteArray& text) {
    responder = [prefix, text](ScriptedServer& server, const QByteArray& line) {
        if (!line.startsWith(prefix))
            return false;
        server.reply(text);
        return true;
    };
}

void ScriptedServer::reply(const QByteArray& text) {
    if (pieceSize <= 0) {
        m_client->write(text);
        return;
    }
    // Pieces apart in time reach the client in separate reads, so replies split mid-line
    // and across lines are really seen by it.
    int delay = 0;
    for (qsizetype at = 0; at < text.size(); at += pieceSize, delay += 20)
        QTimer::singleShot(std::chrono::milliseconds(delay), this,
                           [client = m_client, piece = text.mid(at, pieceSize)] {
                               if (client) {
                                   client->write(piece);
                                   client->flush();
                               }
                           });
}

void ScriptedServer::standardReply(const QByteArray& line) {
    const QByteArray verb = line.left(4).toUpper();
    if (verb == "EHLO") {
        reply(ehloReply);
    } else if (verb == "HELO") {
        reply("250 localhost\r\n");
    } else if (verb == "MAIL" || verb == "RCPT" || verb == "RSET" || verb == "NOOP") {
        reply("250 2.0.0 OK\r\n");
    } else if (verb == "DATA") {
        reply("354 End data with <CR><LF>.<CR><LF>\r\n");
        m_inData = true;
    } else if (verb == "QUIT") {
        reply("221 2.0.0 Bye\r\n");
        hangUp();
    } else {
        reply("502 5.5.2 Command not recognized\r\n");
    }
}

void ScriptedServer::hangUp() {
    m_client->disconnectFromHost();
}

void ScriptedServer::onConnection() {
    m_client = m_server.nextPendingConnection();
    m_client->setSocketOption(QAbstractSocket::LowDelayOption, 1);
    connect(m_client, &QTcpSocket::readyRead, this, &ScriptedServer::onReadyRead);
    connect(m_client, &QTcpSocket::disconnected, this, [this] { m_clientDisconnected = true; });
    if (!greeting.isEmpty())
        reply(greeting);
}

void ScriptedServer::onReadyRead() {
    m_buffer += m_client->readAll();
    while (m_client && (m_inData ? takeData() : takeLine())) {
    }
}

bool ScriptedServer::takeData() {
    if (dropWhenDataArrives && !m_buffer.isEmpty()) {
        m_client->abort();
        return false;
    }
    qsizetype end = -1;
    if (m_buffer.startsWith(".\r\n"))
        end = 3;
    else if (const qsizetype at = m_buffer.indexOf("\r\n.\r\n"); at >= 0)
        end = at + 5;
    if (end < 0)
        return false;
    m_data = m_buffer.left(end);
    m_buffer.remove(0, end);
    m_inData = false;
    reply(endOfDataReply);
    return true;
}

bool ScriptedServer::takeLine() {
    const qsizetype end = m_buffer.indexOf("\r\n");
    if (end < 0)
        return false;
    const QByteArray line = m_buffer.left(end);
    m_buffer.remove(0, end + 2);
    m_commands += line;
    if (!responder || !responder(*this, line))
        standardReply(line);
    return true;
}
