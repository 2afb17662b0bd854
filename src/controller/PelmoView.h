#pragma once

#include <QString>

/**
 * What the controller needs of the window it drives: three text fields, the status line, the
 * progress indicator, the Send button, the sent-recipients window, alerts and the beep. The
 * desktop window, the command line's console and the tests' recording view each implement
 * it. The controller calls it on the main thread only and never keeps what it answers.
 */
class PelmoView {
public:
    /** The recipient and subject fields, as textDidChange names them. */
    enum class Field { Subject, To, Name };

    virtual ~PelmoView() = default;

    virtual QString subject() const = 0;
    virtual void setSubject(const QString& text) = 0;
    /** The recipient address field. */
    virtual QString to() const = 0;
    virtual void setTo(const QString& text) = 0;
    /** The recipient display-name field. */
    virtual QString name() const = 0;
    virtual void setName(const QString& text) = 0;

    /** The web page field: the address of a page to mail with every copy. */
    virtual QString webPageOrFile() const = 0;
    virtual void setWebPageOrFile(const QString& text) = 0;
    /** Replaces the one-line status display. */
    virtual void setStatus(const QString& text) = 0;

    /** Makes the progress indicator a determinate bar over [minimum, maximum] at value. */
    virtual void setProgressCounting(double minimum, double maximum, double value) = 0;
    /** Makes the progress indicator an indeterminate busy indicator. */
    virtual void setProgressBusy() = 0;
    virtual void setProgressValue(double value) = 0;
    virtual double progressMaximum() const = 0;
    virtual void startProgressAnimation() = 0;
    virtual void stopProgressAnimation() = 0;

    virtual QString sendButtonTitle() const = 0;
    virtual void setSendButtonTitle(const QString& title) = 0;

    /** Brings the sent-recipients window to the front. */
    virtual void showRecipientsWindow() = 0;

    /** Shows a problem the user must act on: a short title and an explanation, one OK button. */
    virtual void alert(const QString& title, const QString& informativeText) = 0;
    virtual void beep() = 0;
};
