#pragma once

#include <QByteArray>
#include <QList>
#include <QObject>
#include <QPointer>
#include <QTcpServer>
#include <QTcpSocket>

#include <functional>

/**
 * An SMTP server on 127.0.0.1 inside the test process, for the conversations a real server
 * would not hold: it answers one connection from a script, misbehaves when told to, and keeps
 * every command line and the raw DATA bytes it received.
 */
class ScriptedServer : public QObject {
public:
    /** Consulted first for every command line; returns true when it answered the line. */
    using Responder = std::function<bool(ScriptedServer& server, const QByteArray& line)>;

    ScriptedServer();

    quint16 port() const { return m_server.serverPort(); }

    QByteArray greeting = "220 localhost ESMTP scripted\r\n";
    QByteArray ehloReply = "250-localhost\r\n250-SIZE 100000\r\n250 AUTH PLAIN LOGIN CRAM-MD5\r\n";
    QByteArray endOfDataReply = "250 2.0.0 queued\r\n";
    Responder responder;
    /** Closes the connection as soon as the first bytes of the message arrive. */
    bool dropWhenDataArrives = false;
    /** Writes each reply in pieces of this many bytes, one event-loop turn apart (0: whole). */
    qsizetype pieceSize = 0;

    /** Answers the command lines starting with `prefix` with `text` instead of the standard. */
    void answer(const QByteArray& prefix, const QByteArray& text);
    void reply(const QByteArray& text);
    void standardReply(const QByteArray& line);
    /** Closes the connection once what was written whole has gone out. */
    void hangUp();

    const QList<QByteArray>& commands() const { return m_commands; }
    /** The raw bytes between the 354 and the end of data, the final ".\r\n" included. */
    const QByteArray& data() const { return m_data; }
    bool clientDisconnected() const { return m_clientDisconnected; }

private:
    void onConnection();
    void onReadyRead();
    bool takeData();
    bool takeLine();

    QTcpServer m_server;
    QPointer<QTcpSocket> m_client;
    QByteArray m_buffer;
    bool m_inData = false;
    bool m_clientDisconnected = false;
    QList<QByteArray> m_commands;
    QByteArray m_data;
};
