#include "browser/PageDownload.h"

#include "util/TextUtilities.h"

#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QNetworkRequest>
#include <QRegularExpression>
#include <QUrl>

#include <iconv.h>

#include <memory>

namespace {

// Whole-text conversion through iconv; null when the charset is unknown or a byte is invalid.
QString convert(const QByteArray& bytes, const QByteArray& charset) {
    iconv_t cd = iconv_open("UTF-8", charset.constData());
    if (cd == reinterpret_cast<iconv_t>(-1))
        return {};
    std::unique_ptr<void, int (*)(iconv_t)> closer(cd, iconv_close);
    QByteArray out(bytes.size() * 4 + 4, Qt::Uninitialized);
    char* in = const_cast<char*>(bytes.constData());
    size_t inLeft = static_cast<size_t>(bytes.size());
    char* outPtr = out.data();
    size_t outLeft = static_cast<size_t>(out.size());
    if (iconv(cd, &in, &inLeft, &outPtr, &outLeft) == static_cast<size_t>(-1))
        return {};
    out.truncate(out.size() - static_cast<qsizetype>(outLeft));
    return QString::fromUtf8(out);
}

// The charset named by the Content-Type header, else by the page's own meta element.
QByteArray declaredCharset(const QNetworkReply& reply, const QByteArray& bytes) {
    static const QRegularExpression charset(
        QStringLiteral(R"(charset\s*=\s*["']?([A-Za-z0-9._:-]+))"),
        QRegularExpression::CaseInsensitiveOption);
    const QString header = reply.header(QNetworkRequest::ContentTypeHeader).toString();
    QRegularExpressionMatch match = charset.match(header);
    if (!match.hasMatch())
        match = charset.match(QString::fromLatin1(bytes.left(4096)));
    return match.hasMatch() ? match.captured(1).toLatin1() : QByteArray();
}

QString decodePage(const QNetworkReply& reply, const QByteArray& bytes) {
    QString text = DecodeUtf8Strictly(bytes);
    if (text.isNull()) {
        const QByteArray declared = declaredCharset(reply, bytes);
        if (!declared.isEmpty())
            text = convert(bytes, declared);
    }
    if (text.isNull())
        text = convert(bytes, "MACINTOSH");
    return text;
}

} // namespace

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
    const QString text = decodePage(*reply, bytes);
    finish(text,
           text.isNull() ? QStringLiteral("the page's characters cannot be read") : QString());
}

void PageDownload::finish(const QString& text, const QString& error) {
    if (m_state != State::Downloading)
        return;
    m_state = State::Finished;
    Q_EMIT finished(text, error);
}
