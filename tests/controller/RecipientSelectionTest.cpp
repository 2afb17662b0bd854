#include "ControllerFixture.h"

#include "controller/RecipientSelection.h"
#include "controller/SentRecipients.h"

namespace {

class Selection : public ControllerFixture {
protected:
    void SetUp() override {
        ControllerFixture::SetUp();
        QList<ImportedContact> contacts;
        for (const char* first : {"Ada", "Alan", "Grace", "Charles", "Marie", "Pierre"})
            contacts.append({person(first, {QString::fromLatin1(first).toLower() + "@example.org"}),
                             {QLatin1String(first[0] == 'P' ? "Family" : "Friends")}});
        contacts.append({person("Nomail", {}), {QStringLiteral("Family")}});
        contacts.append({Person{0, QStringLiteral("Cher"), {}, {"cher@example.org"}, 0}, {}});
        book->add(contacts);
        friends = book->groupNamed(QStringLiteral("Friends"))->id;
        family = book->groupNamed(QStringLiteral("Family"))->id;
    }
    static Person person(const char* first, const QStringList& addresses) {
        return {0, QLatin1String(first), QStringLiteral("Example"), addresses,
                addresses.isEmpty() ? -1 : 0};
    }
    QString pending() const {
        QStringList names;
        for (const Person& person : controller->getPeople().value_or(QList<Person>()))
            names << person.firstName;
        return controller->getPeople() ? names.join(QLatin1Char(' ')) : QStringLiteral("none");
    }
    qint64 id(const char* first) const {
        for (const Person& person : book->persons())
            if (person.firstName == QLatin1String(first))
                return person.id;
        return 0;
    }

    qint64 friends = 0, family = 0;
};

TEST_F(Selection, GroupLessThoseMailed) {
    for (const char* address : {"GRACE@example.org", "ada@example.org", "pierre@example.org"})
        controller->sentRecipients().addRecipient(QLatin1String(address));
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(pending(), QStringLiteral("Alan Charles Marie"));
    EXPECT_EQ(view.statuses,
              QStringList({"Filtering people by sent recipients...", "Skipping ada@example.org",
                           "Skipping grace@example.org"}));
    EXPECT_EQ(view.toText + view.nameText, QStringLiteral("FriendsFriends"));
    // Only the first of several groups counts; a person without an address stays.
    controller->abGroupSelected({family, friends}, true);
    EXPECT_EQ(pending(), QStringLiteral("Nomail"));
    // No group, or one that has gone, changes nothing.
    controller->abGroupSelected({}, true);
    controller->abGroupSelected({987654}, true);
    EXPECT_EQ(pending() + " " + view.toText, QStringLiteral("Nomail Family"));
    // Chosen outside the picker: the selection, not the fields.
    controller->abGroupSelected({friends}, false);
    EXPECT_EQ(pending() + " " + view.toText, QStringLiteral("Alan Charles Marie Family"));
}

TEST_F(Selection, EditsOfToOrNameDropTheGroup) {
    for (const auto& [field, kept] : {std::pair{PelmoView::Field::To, false},
                                      {PelmoView::Field::Name, false},
                                      {PelmoView::Field::Subject, true}}) {
        controller->abGroupSelected({family}, true);
        controller->textDidChange(field);
        EXPECT_EQ(controller->getPeople().has_value(), kept) << int(field);
    }
    controller->selection().setPeople({});
    EXPECT_TRUE(controller->getPeople().has_value()); // an empty selection is still one
}

TEST_F(Selection, PersonMeansOneMessage) {
    controller->abGroupSelected({friends}, true);
    controller->abRecordSelected({id("Alan")}, {QStringLiteral("alan.work@example.org")}, true);
    EXPECT_EQ(pending() + " " + view.nameText + " " + view.toText,
              "none Alan Example alan.work@example.org");
    // No address clicked: the first person's primary one; a missing name part prints (null).
    controller->abRecordSelected({id("Cher"), id("Ada")}, {}, true);
    EXPECT_EQ(view.nameText + " " + view.toText, "Cher (null) cher@example.org");
    // Outside the picker only the group goes.
    controller->abGroupSelected({friends}, true);
    controller->abRecordSelected({id("Alan")}, {}, false);
    EXPECT_EQ(pending() + " " + view.toText, QStringLiteral("none Friends"));
}

} // namespace
