#include "ControllerFixture.h"

namespace {

class Selection : public ControllerFixture {
protected:
    void SetUp() override {
        ControllerFixture::SetUp();
        QList<ImportedContact> contacts;
        for (const char* first : {"Ada", "Alan", "Grace", "Charles", "Marie"})
            contacts.append(contact(first, "Friends"));
        contacts.append(contact("Pierre", "Family"));
        contacts.append({Person{0, QStringLiteral("Nomail"), QStringLiteral("Person"), {}, -1},
                         {QStringLiteral("Family")}});
        book->add(contacts);
        friends = book->groupNamed(QStringLiteral("Friends"))->id;
        family = book->groupNamed(QStringLiteral("Family"))->id;
    }

    static ImportedContact contact(const char* first, const char* group) {
        Person person;
        person.firstName = QString::fromLatin1(first);
        person.lastName = QStringLiteral("Example");
        person.emails = {person.firstName.toLower() + QStringLiteral("@example.org")};
        person.primary = 0;
        return {person, {QString::fromLatin1(group)}};
    }

    QStringList pendingFirstNames() const {
        QStringList names;
        for (const Person& person : controller->getPeople().value_or(QList<Person>()))
            names << person.firstName;
        return names;
    }

    qint64 personId(const char* first) const {
        for (const Person& person : book->persons())
            if (person.firstName == QLatin1String(first))
                return person.id;
        return 0;
    }

    qint64 friends = 0, family = 0;
};

TEST_F(Selection, GroupMembersAlreadyMailedAreSkippedInOrder) {
    controller->addRecipient(QStringLiteral("GRACE@example.org"));
    controller->addRecipient(QStringLiteral("ada@example.org"));
    controller->addRecipient(QStringLiteral("someone@else.org"));
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(pendingFirstNames(), QStringList({"Alan", "Charles", "Marie"}));
    EXPECT_EQ(view.statuses,
              QStringList({"Filtering people by sent recipients...", "Skipping ada@example.org",
                           "Skipping grace@example.org"}));
    EXPECT_EQ(view.toText, QStringLiteral("Friends"));
    EXPECT_EQ(view.nameText, QStringLiteral("Friends"));
}

TEST_F(Selection, NothingMailedYetMeansNoFiltering) {
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(pendingFirstNames(), QStringList({"Ada", "Alan", "Grace", "Charles", "Marie"}));
    EXPECT_TRUE(view.statuses.isEmpty());
}

TEST_F(Selection, PersonsWithoutAddressAreKept) {
    controller->addRecipient(QStringLiteral("pierre@example.org"));
    controller->abGroupSelected({family}, true);
    EXPECT_EQ(pendingFirstNames(), QStringList({"Nomail"}));
}

TEST_F(Selection, OnlyTheFirstOfSeveralGroupsCounts) {
    controller->abGroupSelected({family, friends}, true);
    EXPECT_EQ(pendingFirstNames(), QStringList({"Pierre", "Nomail"}));
    EXPECT_EQ(view.toText, QStringLiteral("Family"));
}

TEST_F(Selection, GroupChosenOutsideThePickerLeavesTheFields) {
    view.toText = QStringLiteral("typed@example.org");
    view.nameText = QStringLiteral("Typed");
    controller->abGroupSelected({friends}, false);
    EXPECT_EQ(pendingFirstNames().size(), 5);
    EXPECT_EQ(view.toText, QStringLiteral("typed@example.org"));
    EXPECT_EQ(view.nameText, QStringLiteral("Typed"));
}

TEST_F(Selection, NoGroupOrAVanishedOneChangesNothing) {
    controller->abGroupSelected({family}, true);
    controller->abGroupSelected({}, true);
    controller->abGroupSelected({987654}, true);
    EXPECT_EQ(pendingFirstNames(), QStringList({"Pierre", "Nomail"}));
    EXPECT_EQ(view.toText, QStringLiteral("Family"));
}

TEST_F(Selection, TypingInToOrNameDiscardsTheGroup) {
    for (const PelmoView::Field field : {PelmoView::Field::To, PelmoView::Field::Name}) {
        controller->abGroupSelected({friends}, true);
        ASSERT_TRUE(controller->getPeople().has_value());
        controller->textDidChange(field);
        EXPECT_FALSE(controller->getPeople().has_value());
    }
}

TEST_F(Selection, TypingInTheSubjectKeepsTheGroup) {
    controller->abGroupSelected({friends}, true);
    controller->textDidChange(PelmoView::Field::Subject);
    EXPECT_EQ(pendingFirstNames().size(), 5);
}

TEST_F(Selection, AnEmptySelectionIsNotNoSelection) {
    EXPECT_FALSE(controller->getPeople().has_value());
    controller->setPeople({});
    ASSERT_TRUE(controller->getPeople().has_value());
    EXPECT_TRUE(controller->getPeople()->isEmpty());
}

TEST_F(Selection, PersonSelectionMeansOneMessage) {
    controller->abGroupSelected({friends}, true);
    controller->abRecordSelected({personId("Alan")}, {QStringLiteral("alan.work@example.org")},
                                 true);
    EXPECT_FALSE(controller->getPeople().has_value());
    EXPECT_EQ(view.nameText, QStringLiteral("Alan Example"));
    EXPECT_EQ(view.toText, QStringLiteral("alan.work@example.org"));
    // No address clicked: the person's primary one.
    controller->abRecordSelected({personId("Grace"), personId("Ada")}, {}, true);
    EXPECT_EQ(view.nameText, QStringLiteral("Grace Example"));
    EXPECT_EQ(view.toText, QStringLiteral("grace@example.org"));
}

TEST_F(Selection, PersonSelectionOutsideThePickerOnlyClearsTheGroup) {
    controller->abGroupSelected({friends}, true);
    controller->abRecordSelected({personId("Alan")}, {QStringLiteral("alan@example.org")}, false);
    EXPECT_FALSE(controller->getPeople().has_value());
    EXPECT_EQ(view.toText, QStringLiteral("Friends"));
    EXPECT_EQ(view.nameText, QStringLiteral("Friends"));
}

TEST_F(Selection, MissingNamePartPrintsAsNull) {
    book->add(
        {{Person{0, QStringLiteral("Cher"), QString(), {QStringLiteral("cher@example.org")}, 0},
          {}}});
    controller->abRecordSelected({personId("Cher")}, {}, true);
    EXPECT_EQ(view.nameText, QStringLiteral("Cher (null)"));
}

// The filter is built for long lists; its answer must be the plain walk's answer.
TEST_F(ControllerFixture, LargeFilterAgreesWithAPlainWalk) {
    QList<Person> persons;
    for (int i = 0; i < 3000; ++i)
        persons.append(Person{i + 1,
                              QStringLiteral("P"),
                              QString::number(i),
                              {QStringLiteral("p%1@example.org").arg(i)},
                              0});
    QStringList sent;
    for (int i = 0; i < 3000; i += 7)
        sent << QStringLiteral("P%1@EXAMPLE.org").arg(i);
    for (const QString& address : sent)
        controller->addRecipient(address);
    controller->setPeople(persons);
    controller->filterPeopleByRecipients();

    QStringList expectedSkips;
    QList<qint64> expectedKept;
    for (const Person& person : persons) {
        bool mailed = false;
        for (const QString& address : sent)
            mailed = mailed || address.compare(person.primaryEmail(), Qt::CaseInsensitive) == 0;
        if (mailed)
            expectedSkips << QStringLiteral("Skipping ") + person.primaryEmail();
        else
            expectedKept << person.id;
    }
    QList<qint64> kept;
    for (const Person& person : *controller->getPeople())
        kept << person.id;
    EXPECT_EQ(kept, expectedKept);
    EXPECT_EQ(view.statuses.mid(1), expectedSkips);
}

} // namespace
