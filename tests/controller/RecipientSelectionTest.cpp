#include "ControllerFixture.h"

#include "controller/RecipientSelection.h"
#include "controller/SentRecipients.h"

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
        contacts.append({Person{0, QStringLiteral("Cher"), {}, {"cher@example.org"}, 0}, {}});
        book->add(contacts);
        friends = book->groupNamed(QStringLiteral("Friends"))->id;
        family = book->groupNamed(QStringLiteral("Family"))->id;
    }
    static ImportedContact contact(const char* first, const char* group) {
        const QString name = QString::fromLatin1(first);
        return {Person{0, name, QStringLiteral("Example"), {name.toLower() + "@example.org"}, 0},
                {QString::fromLatin1(group)}};
    }
    QString pending() const {
        if (!controller->getPeople())
            return QStringLiteral("none");
        QStringList names;
        for (const Person& person : *controller->getPeople())
            names << person.firstName;
        return names.join(QLatin1Char(' '));
    }
    qint64 personId(const char* first) const {
        for (const Person& person : book->persons())
            if (person.firstName == QLatin1String(first))
                return person.id;
        return 0;
    }
    void mailed(const QStringList& addresses) {
        for (const QString& address : addresses)
            controller->sentRecipients().addRecipient(address);
    }

    qint64 friends = 0, family = 0;
};

TEST_F(Selection, GroupLessThoseMailed) {
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(pending(), QStringLiteral("Ada Alan Grace Charles Marie"));
    EXPECT_TRUE(view.statuses.isEmpty()); // nothing mailed yet, nothing filtered
    mailed({"GRACE@example.org", "ada@example.org", "someone@else.org", "pierre@example.org"});
    controller->abGroupSelected({friends}, true);
    EXPECT_EQ(pending(), QStringLiteral("Alan Charles Marie"));
    EXPECT_EQ(view.statuses,
              QStringList({"Filtering people by sent recipients...", "Skipping ada@example.org",
                           "Skipping grace@example.org"}));
    EXPECT_EQ(view.toText + view.nameText, QStringLiteral("FriendsFriends"));
    // Only the first of several groups counts; a person without an address stays.
    controller->abGroupSelected({family, friends}, true);
    EXPECT_EQ(pending(), QStringLiteral("Nomail"));
    EXPECT_EQ(view.toText, QStringLiteral("Family"));
    // No group, or one that has gone, changes nothing.
    controller->abGroupSelected({}, true);
    controller->abGroupSelected({987654}, true);
    EXPECT_EQ(pending(), QStringLiteral("Nomail"));
    // Chosen outside the picker: the selection, not the fields.
    controller->abGroupSelected({friends}, false);
    EXPECT_EQ(pending(), QStringLiteral("Alan Charles Marie"));
    EXPECT_EQ(view.toText, QStringLiteral("Family"));
}

TEST_F(Selection, EditsOfToOrNameDropTheGroup) {
    const struct {
        PelmoView::Field field;
        bool kept;
    } rows[] = {{PelmoView::Field::To, false},
                {PelmoView::Field::Name, false},
                {PelmoView::Field::Subject, true}};
    for (const auto& row : rows) {
        controller->abGroupSelected({family}, true);
        controller->textDidChange(row.field);
        EXPECT_EQ(controller->getPeople().has_value(), row.kept) << int(row.field);
    }
    controller->selection().setPeople({});
    EXPECT_TRUE(controller->getPeople().has_value()); // an empty selection is still one
}

TEST_F(Selection, PersonMeansOneMessage) {
    controller->abGroupSelected({friends}, true);
    controller->abRecordSelected({personId("Alan")}, {QStringLiteral("alan.work@example.org")},
                                 true);
    EXPECT_EQ(pending(), QStringLiteral("none"));
    EXPECT_EQ(view.nameText + " " + view.toText, "Alan Example alan.work@example.org");
    // No address clicked: the first person's primary one; a missing name part prints (null).
    controller->abRecordSelected({personId("Cher"), personId("Ada")}, {}, true);
    EXPECT_EQ(view.nameText + " " + view.toText, "Cher (null) cher@example.org");
    // Outside the picker only the group goes.
    controller->abGroupSelected({friends}, true);
    controller->abRecordSelected({personId("Alan")}, {}, false);
    EXPECT_EQ(pending(), QStringLiteral("none"));
    EXPECT_EQ(view.toText, QStringLiteral("Friends"));
}

// The filter is built for long lists; its answer must be the plain walk's answer.
TEST_F(ControllerFixture, LargeFilterAgreesWithAPlainWalk) {
    QList<Person> persons;
    for (int i = 0; i < 3000; ++i)
        persons.append(
            Person{i + 1, "P", QString::number(i), {QString("p%1@example.org").arg(i)}, 0});
    QStringList sent;
    for (int i = 0; i < 3000; i += 7)
        sent << QStringLiteral("P%1@EXAMPLE.org").arg(i);
    for (const QString& address : sent)
        controller->sentRecipients().addRecipient(address);
    controller->selection().setPeople(persons);
    controller->selection().filterPeopleByRecipients();
    QStringList expectedSkips;
    QList<qint64> expectedKept, kept;
    for (const Person& person : persons) {
        const bool mailed = std::any_of(sent.begin(), sent.end(), [&](const QString& address) {
            return address.compare(person.primaryEmail(), Qt::CaseInsensitive) == 0;
        });
        mailed ? void(expectedSkips << "Skipping " + person.primaryEmail())
               : expectedKept.append(person.id);
    }
    for (const Person& person : *controller->getPeople())
        kept << person.id;
    EXPECT_EQ(kept, expectedKept);
    EXPECT_EQ(view.statuses.mid(1), expectedSkips);
}

} // namespace
