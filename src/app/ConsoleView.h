#pragma once

#include "controller/PelmoView.h"

/**
 * The controller's window on a terminal: every status line is printed to standard output as
 * the window would show it, alerts go to standard error, and the fields live in memory. The
 * progress indicator has nothing to show.
 */
class ConsoleView : public PelmoView {
public:
    /** The Send button starts out reading "Send", as the window's does. */
    ConsoleView();

    QString subject() const override { return m_subject; }
    void setSubject(const QString& text) override { m_subject = text; }
    QString to() const override { return m_to; }
    void setTo(const QString& text) override { m_to = text; }
    QString name() const override { return m_name; }
    void setName(const QString& text) override { m_name = text; }
    QString webPageOrFile() const override { return m_page; }
    void setWebPageOrFile(const QString& text) override { m_page = text; }
    void setStatus(const QString& text) override;
    void setProgressCounting(double, double maximum, double) override { m_maximum = maximum; }
    void setProgressBusy() override {}
    void setProgressValue(double) override {}
    double progressMaximum() const override { return m_maximum; }
    void startProgressAnimation() override {}
    void stopProgressAnimation() override {}
    QString sendButtonTitle() const override { return m_button; }
    void setSendButtonTitle(const QString& title) override { m_button = title; }
    void showRecipientsWindow() override {}
    void alert(const QString& title, const QString& informativeText) override;
    void beep() override {}

private:
    QString m_subject, m_to, m_name, m_page, m_button;
    double m_maximum = 0;
};
