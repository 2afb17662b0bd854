#include "ControllerFixture.h"

#include "RowName.h"

#include "util/CLog.h"
#include "util/PelmoException.h"

#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>

#include <QDateTime>
#include <QTextDocument>

#include <functional>

namespace {

struct RequiredValue {
    const char* name;
    QString (PelmoController::*getter)();
    const char* settingKey;        // null for a window field
    QString RecordingView::*field; // the window field otherwise
    const char* failure;
    const char* reason;
};

void PrintTo(const RequiredValue& row, std::ostream* out) {
    *out << row.name;
}

class RequiredValues : public ControllerFixture,
                       public ::testing::WithParamInterface<RequiredValue> {
protected:
    void store(const QString& value) {
        const RequiredValue& row = GetParam();
        if (row.settingKey)
            set(row.settingKey, value);
        else
            view.*row.field = value;
    }
    QString get() { return ((*controller).*GetParam().getter)(); }
};

const RequiredValue kRequired[] = {
    {"To", &PelmoController::getTo, nullptr, &RecordingView::toText, "NoRecipientsEmail",
     "The 'Recipient Address:' value has not been specified."},
    {"ToName", &PelmoController::getToName, nullptr, &RecordingView::nameText, "NoRecipientsName",
     "The 'Recipients Name:' value has not been specified."},
    {"From", &PelmoController::getFrom, "senderEmail", nullptr, "NoSenderEmailAddress",
     "The sender 'Email Address:' preference value has not been specified."},
    {"FromName", &PelmoController::getFromName, "senderName", nullptr, "NoSenderName",
     "The sender 'Name:' preference value has not been specified."},
    {"Server", &PelmoController::getServer, "serverAddress", nullptr, "NoServer",
     "The outgoing SMTP server 'Address:' preference value has not been specified."},
    {"Username", &PelmoController::getUsername, "loginUsername", nullptr, "NoUsername",
     "The outgoing SMTP server 'Username:' preference value has not been specified."},
    {"Password", &PelmoController::getPassword, "loginPassword", nullptr, "NoPassword",
     "The outgoing SMTP server 'Password:' preference value has not been specified."},
};

void expectFailure(const std::function<void()>& call, const char* name, const char* reason) {
    try {
        call();
        ADD_FAILURE() << "no failure raised, expected " << name;
    } catch (const PelmoException& failure) {
        EXPECT_EQ(failure.name(), QLatin1String(name));
        EXPECT_EQ(failure.reason(), QLatin1String(reason));
    }
}

TEST_P(RequiredValues, MissingFailsWithItsNameAndReason) {
    expectFailure([&] { get(); }, GetParam().failure, GetParam().reason);
}

TEST_P(RequiredValues, EmptyFailsLikeMissing) {
    store(QString(""));
    expectFailure([&] { get(); }, GetParam().failure, GetParam().reason);
}

TEST_P(RequiredValues, PresentValueIsAnsweredAsItStands) {
    store(QStringLiteral(" Value, with comma "));
    EXPECT_EQ(get(), QStringLiteral(" Value, with comma "));
}

INSTANTIATE_TEST_SUITE_P(Settings, RequiredValues, ::testing::ValuesIn(kRequired), RowName());

struct PortCase {
    const char* name;
    QVariant stored; // invalid: the key is absent
    bool valid;
};

void PrintTo(const PortCase& row, std::ostream* out) {
    *out << row.name;
}

class PortBounds : public ControllerFixture, public ::testing::WithParamInterface<PortCase> {};

TEST_P(PortBounds, OneTo65365) {
    const PortCase& row = GetParam();
    if (row.stored.isValid())
        set("serverPort", row.stored);
    if (row.valid) {
        EXPECT_EQ(controller->getPort(), row.stored.toInt());
        return;
    }
    expectFailure([&] { controller->getPort(); }, "BadPort",
                  "The outgoing SMTP server 'Port:' preference value is out of range.");
}

INSTANTIATE_TEST_SUITE_P(
    Settings, PortBounds,
    ::testing::Values(PortCase{"Missing", QVariant(), false}, PortCase{"Zero", 0, false},
                      PortCase{"One", 1, true}, PortCase{"Submission", 587, true},
                      PortCase{"UpperBound", 65365, true}, PortCase{"AboveBound", 65366, false},
                      PortCase{"Max16Bit", 65535, false}, PortCase{"Negative", -25, false},
                      PortCase{"Text", QStringLiteral("smtp"), false},
                      PortCase{"TextNumber", QStringLiteral("2525"), true}),
    RowName());

TEST_F(ControllerFixture, UnsetIntegersAreZeroAndUnsetBooleanIsFalse) {
    EXPECT_EQ(controller->getSelectedContentType(), 0);
    EXPECT_EQ(controller->getSelectedCharacterSet(), 0);
    EXPECT_EQ(controller->getSelectedLoginMechanism(), 0);
    EXPECT_EQ(controller->completionAction(), 0);
    EXPECT_FALSE(controller->useSSL());
    set("selectedContentType", 1);
    set("selectedCharacterSet", 3);
    set("selectedAuthentication", 2);
    set("completionAction", 2);
    set("useSSL", true);
    EXPECT_EQ(controller->getSelectedContentType(), 1);
    EXPECT_EQ(controller->getSelectedCharacterSet(), 3);
    EXPECT_EQ(controller->getSelectedLoginMechanism(), 2);
    EXPECT_EQ(controller->completionAction(), 2);
    EXPECT_TRUE(controller->useSSL());
}

TEST_F(ControllerFixture, DefaultRecipientIsNullWhenUnsetAndEmptyWhenBlank) {
    EXPECT_TRUE(controller->getDefaultTo().isNull());
    EXPECT_TRUE(controller->getDefaultToName().isNull());
    set("defaultRecipientEmail", QString(""));
    set("defaultRecipientName", QStringLiteral("Team"));
    EXPECT_FALSE(controller->getDefaultTo().isNull());
    EXPECT_TRUE(controller->getDefaultTo().isEmpty());
    EXPECT_EQ(controller->getDefaultToName(), QStringLiteral("Team"));
}

// The preferences of another process rewrite the file; the next read must see it.
TEST_F(ControllerFixture, EveryReadSyncsFirst) {
    set("serverAddress", QStringLiteral("old.example.org"));
    set("serverPort", 25);
    EXPECT_EQ(controller->getServer(), QStringLiteral("old.example.org"));
    const QString file = settings().fileName();
    QSettings earlier(QStringLiteral("Orvale Software"), QStringLiteral("Pelmo"));
    ASSERT_EQ(earlier.value(QStringLiteral("serverPort")).toInt(), 25);

    QFile rewrite(file);
    ASSERT_TRUE(rewrite.open(QIODevice::WriteOnly | QIODevice::Truncate));
    rewrite.write("[General]\nserverAddress=new.mail.example.org\nserverPort=2525\n");
    rewrite.close();
    ASSERT_TRUE(rewrite.open(QIODevice::ReadWrite));
    rewrite.setFileTime(QDateTime::currentDateTime().addSecs(5), QFileDevice::FileModificationTime);
    rewrite.close();

    // Without a sync a settings object still answers from what it read before.
    EXPECT_EQ(earlier.value(QStringLiteral("serverPort")).toInt(), 25);
    EXPECT_EQ(controller->getServer(), QStringLiteral("new.mail.example.org"));
    EXPECT_EQ(controller->getPort(), 2525);
}

TEST_F(ControllerFixture, PasswordComesFromTheKeyringFirst) {
    set("loginPassword", QStringLiteral("from-settings"));
    keyring.stored = QStringLiteral("from-keyring");
    EXPECT_EQ(controller->getPassword(), QStringLiteral("from-keyring"));
    keyring.stored.clear();
    EXPECT_EQ(controller->getPassword(), QStringLiteral("from-settings"));
    EXPECT_EQ(keyring.reads, 2);
}

TEST_F(ControllerFixture, PasswordIsNeverShownNorLogged) {
    const QString data = QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation);
    StartLogging();
    keyring.stored = QStringLiteral("s3cret-pw");
    controller->statusMsg(QStringLiteral("before"));
    EXPECT_EQ(controller->getPassword(), QStringLiteral("s3cret-pw"));
    StopLogging();
    QFile log(data + QStringLiteral("/Orvale Software/Pelmo/Pelmo.log"));
    ASSERT_TRUE(log.open(QIODevice::ReadOnly));
    const QByteArray logged = log.readAll();
    EXPECT_TRUE(logged.contains("before"));
    EXPECT_FALSE(logged.contains("s3cret"));
    EXPECT_FALSE(view.statuses.join(QLatin1Char('\n')).contains(QStringLiteral("s3cret")));
}

TEST_F(ControllerFixture, StartUpFillsTheRecipientFromPresentDefaults) {
    set("defaultRecipientEmail", QStringLiteral("team@example.org"));
    controller->addRecipient(QStringLiteral("earlier@example.org"));
    view.nameText = QStringLiteral("typed");
    controller->startUp();
    EXPECT_EQ(view.toText, QStringLiteral("team@example.org"));
    EXPECT_EQ(view.nameText, QStringLiteral("typed")); // no default name: left alone
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Ready."));
    EXPECT_FALSE(controller->getPeople().has_value());
    EXPECT_EQ(controller->numberOfRows(), 0);
}

TEST_F(ControllerFixture, ResetClearsTheForm) {
    controller->message()->setPlainText(QStringLiteral("Old text"));
    view.subjectText = QStringLiteral("Old subject");
    view.toText = QStringLiteral("old@example.org");
    view.nameText = QStringLiteral("Old");
    set("defaultRecipientName", QStringLiteral("Team"));
    controller->reset();
    EXPECT_TRUE(controller->message()->isEmpty());
    EXPECT_TRUE(view.subjectText.isEmpty());
    EXPECT_TRUE(view.toText.isEmpty());
    EXPECT_EQ(view.nameText, QStringLiteral("Team"));
    EXPECT_EQ(view.statuses.last(), QStringLiteral("Ready."));
}

TEST_F(ControllerFixture, AlertBeepsFirst) {
    controller->doAlert(QStringLiteral("Title"), QStringLiteral("Explanation"));
    EXPECT_EQ(view.events,
              QStringList({QStringLiteral("beep"), QStringLiteral("alert: Title / Explanation")}));
}

} // namespace
