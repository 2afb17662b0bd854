#pragma once

#include "controller/PelmoView.h"

#include <QStringList>

// A view that keeps what the controller shows and writes every change the controller makes to
// it into one transcript, in order.
class RecordingView : public PelmoView {
public:
    QString subjectText, toText, nameText, pageText, buttonTitle = QStringLiteral("Send");
    QStringList statuses, events /* beeps and alerts */, transcript;
    double maximum = 0;

    QString subject() const override { return subjectText; }
    void setSubject(const QString& text) override { note("subject", subjectText = text); }
    QString to() const override { return toText; }
    void setTo(const QString& text) override { note("to", toText = text); }
    QString name() const override { return nameText; }
    void setName(const QString& text) override { note("name", nameText = text); }
    QString webPageOrFile() const override { return pageText; }
    void setWebPageOrFile(const QString& text) override { note("page", pageText = text); }
    void setStatus(const QString& text) override {
        note("status", dateless(text)), statuses << text;
    }
    void setProgressCounting(double min, double max, double val) override {
        note("bar", QStringLiteral("%1..%2 at %3").arg(min).arg(maximum = max).arg(val));
    }
    void setProgressBusy() override { note("bar", QStringLiteral("busy")); }
    void setProgressValue(double val) override { note("bar", QStringLiteral("at %1").arg(val)); }
    double progressMaximum() const override { return maximum; }
    void startProgressAnimation() override { note("bar", QStringLiteral("spins")); }
    void stopProgressAnimation() override { note("bar", QStringLiteral("still")); }
    QString sendButtonTitle() const override { return buttonTitle; }
    void setSendButtonTitle(const QString& title) override { note("button", buttonTitle = title); }
    void showRecipientsWindow() override { note("window", QStringLiteral("sent recipients")); }
    void alert(const QString& title, const QString& text) override {
        events << QStringLiteral("alert: %1 / %2").arg(title, text);
        note("alert", events.last());
    }
    void beep() override { events << QStringLiteral("beep"), transcript << events.last(); }

    void note(const char* what, const QString& text) {
        transcript << what + QStringLiteral(": ") + text;
    }

    // "[Mailing started at <date>]" and "[<date>] Mail to: ..." with their dates left out.
    static QString dateless(const QString& line) {
        if (line.startsWith(QLatin1String("[Mailing")))
            return line.left(line.indexOf(QLatin1String(" at ")) + 4) + QLatin1String("...]");
        if (line.startsWith(QLatin1Char('[')))
            return QLatin1String("[...]") + line.mid(line.indexOf(QLatin1Char(']')) + 1);
        return line;
    }
};
