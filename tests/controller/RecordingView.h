#pragma once

#include "controller/PelmoView.h"

#include <QStringList>

// A view that keeps what the controller shows and counts how often each field is read.
class RecordingView : public PelmoView {
public:
    QString subjectText, toText, nameText, pageText, buttonTitle = QStringLiteral("Send");
    QStringList statuses;
    QStringList events; // beeps and alerts in order
    mutable int subjectReads = 0, toReads = 0, nameReads = 0;
    int reloads = 0;
    double minimum = 0, maximum = 0, value = 0;
    QList<double> values; // every progress value set, in order
    bool busy = false, animating = false;

    QString subject() const override { return ++subjectReads, subjectText; }
    void setSubject(const QString& text) override { subjectText = text; }
    QString to() const override { return ++toReads, toText; }
    void setTo(const QString& text) override { toText = text; }
    QString name() const override { return ++nameReads, nameText; }
    void setName(const QString& text) override { nameText = text; }
    QString webPageOrFile() const override { return pageText; }
    void setWebPageOrFile(const QString& text) override { pageText = text; }
    void setStatus(const QString& text) override { statuses << text; }
    void setProgressCounting(double min, double max, double val) override {
        busy = false, minimum = min, maximum = max, value = val;
    }
    void setProgressBusy() override { busy = true; }
    void setProgressValue(double val) override { values << (value = val); }
    double progressMaximum() const override { return maximum; }
    void startProgressAnimation() override { animating = true; }
    void stopProgressAnimation() override { animating = false; }
    QString sendButtonTitle() const override { return buttonTitle; }
    void setSendButtonTitle(const QString& title) override { buttonTitle = title; }
    void showRecipientsWindow() override { events << QStringLiteral("recipients window"); }
    void reloadRecipients() override { ++reloads; }
    void alert(const QString& title, const QString& text) override {
        events << QStringLiteral("alert: %1 / %2").arg(title, text);
    }
    void beep() override { events << QStringLiteral("beep"); }
};
