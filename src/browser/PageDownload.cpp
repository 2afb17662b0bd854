#include "browser/PageDownload.h"

#include "util/TextUtilities.h"

#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QRegularExpression>
#include <QUrl>

#include <iconv.h>

#include <cerrno>
#include <memory>

namespace {

// Whole-text conversion through iconv; null when the charset is unknown or a byte is invalid.
// One byte may stand for several characters (TSCII gives up to twelve UTF-8 bytes), and a
// decoder that runs out of room in the middle of such a sequence does not always resume it
// correctly (glibc's TSCII repeats or drops characters), so a conversion that runs out of room
// starts again from the first byte with twice the room. A decoder may also hold the last
// character back to combine it with the next (windows-1258): a call without input ends it.
QString convert(const QByteArray& bytes, const QByteArray& charset) {
    iconv_t cd = iconv_open("UTF-8", charset.constData());
    if (cd == reinterpret_cast<iconv_t>(-1))
        return {};
    std::unique_ptr<void, int (*)(iconv_t)> closer(cd, iconv_close);
    for (qsizetype room = bytes.size() * 4 + 16;; room *= 2) {
        iconv(cd, nullptr, nullptr, nullptr, nullptr); // back to the initial state
        QByteArray out(room, Qt::Uninitialized);
        char* in = const_cast<char*>(bytes.constData());
        size_t inLeft = static_cast<size_t>(bytes.size());
        char* outPtr = out.data();
        size_t outLeft = static_cast<size_t>(room);
        size_t result = iconv(cd, &in, &inLeft, &outPtr, &outLeft);
        if (result != static_cast<size_t>(-1))
            result = iconv(cd, nullptr, nullptr, &outPtr, &outLeft);
        if (result == static_cast<size_t>(-1) && errno == E2BIG)
            continue;
        if (result == static_cast<size_t>(-1))
            return {};
        out.truncate(outPtr - out.data());
        return QString::fromUtf8(out);
    }
}

// The charset named by the Content-Type header, else by the page's own meta element.
QByteArray declaredCharset(const QString& contentType, const QByteArray& bytes) {
    static const QRegularExpression charset(
        QStringLiteral(R"(charset\s*=\s*["']?([A-Za-z0-9._:-]+))"),
        QRegularExpression::CaseInsensitiveOption);
    QRegularExpressionMatch match = charset.match(contentType);
    if (!match.hasMatch())
        match = charset.match(QString::fromLatin1(bytes.left(4096)));
    return match.hasMatch() ? match.captured(1).toLatin1() : QByteArray();
}

} // namespace

QString DecodePage(const QByteArray& bytes, const QString& contentType) {
    QString text = DecodeUtf8Strictly(bytes);
    if (text.isNull()) {
        const QByteArray declared = declaredCharset(contentType, bytes);
        if (!declared.isEmpty())
            text = convert(bytes, declared);
    }
    if (text.isNull())
        text = convert(bytes, "MACINTOSH");
    return text;
}

PageDownload::PageDownload(QObject* parent)
    : QObject(parent), m_network(new QNetworkAccessManager(this)) {}

PageDownload::~PageDownload() {
    if (m_reply)
        m_reply->abort();
}

void PageDownload::start(const QString& url, std::chrono::milliseconds timeout) {
    m_state = State::Downloading;
    const QUrl address(url, QUrl::StrictMode);
    if (!address.isValid() || address.scheme().isEmpty()) {
        QMetaObject::invokeMethod(
            this, [this] { finish({}, QStringLiteral("not a valid address")); },
            Qt::QueuedConnection);
        return;
    }
    QNetworkRequest request(address);
    request.setAttribute(QNetworkRequest::RedirectPolicyAttribute,
                         QNetworkRequest::NoLessSafeRedirectPolicy);
    request.setAttribute(QNetworkRequest::CacheLoadControlAttribute,
                         QNetworkRequest::AlwaysNetwork);
    request.setTransferTimeout(static_cast<int>(timeout.count()));
    m_reply = m_network->get(request);
    connect(m_reply, &QNetworkReply::finished, this, &PageDownload::replied);
}

void PageDownload::abort() {
    if (m_state != State::Downloading)
        return;
    m_state = State::Aborted;
    if (m_reply) {
        disconnect(m_reply, nullptr, this, nullptr);
        m_reply->abort();
        m_reply->deleteLater();
    }
}

void PageDownload::replied() {
    QNetworkReply* reply = m_reply;
    reply->deleteLater();
    if (reply->error() != QNetworkReply::NoError)
        return finish({}, reply->errorString());
    const QByteArray bytes = reply->readAll();
    if (bytes.isEmpty())
        return finish({}, QStringLiteral("the page is empty"));
    const QString text =
        DecodePage(bytes, reply->header(QNetworkRequest::ContentTypeHeader).toString());
    finish(text,
           text.isNull() ? QStringLiteral("the page's characters cannot be read") : QString());
}

void PageDownload::finish(const QString& text, const QString& error) {
    if (m_state != State::Downloading)
        return;
    m_state = State::Finished;
    Q_EMIT finished(text, error);
}
