#include "GuiFixture.h"
#include "controller/RecipientSelection.h"
#include "gui/PersonDialog.h"

#include <QInputDialog>
#include <QLineEdit>
#include <QMessageBox>
#include <QPushButton>
#include <QSignalSpy>
#include <QTableWidget>

namespace {

class Picker : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        ann = addPerson("Ann", "Able", {"ann@example.org", "ann@work.example"},
                        {QStringLiteral("Club")});
        bob = addPerson("Bob", "Baker", {"bob@example.org"}, {QStringLiteral("Club")});
        cy = addPerson("Cy", "Cole", {"cy@example.org"}, {QStringLiteral("Family")});
        picker().reload();
        picker().show();
        groups = child<QListWidget>("groups", &picker());
        persons = child<QListWidget>("persons", &picker());
        addresses = child<QListWidget>("addresses", &picker());
    }

    static QStringList rows(const QListWidget* list) {
        QStringList texts;
        for (int row = 0; row < list->count(); ++row)
            texts << list->item(row)->text();
        return texts;
    }

    QStringList pending() const {
        QStringList names;
        for (const Person& person : controller().getPeople().value_or(QList<Person>()))
            names << person.firstName;
        return names;
    }

    QString to() const { return child<QLineEdit>("to")->text(); }
    QString name() const { return child<QLineEdit>("name")->text(); }

    qint64 ann = 0, bob = 0, cy = 0;
    QListWidget* groups = nullptr;
    QListWidget* persons = nullptr;
    QListWidget* addresses = nullptr;
};

TEST_F(Picker, ShowsAllGroupsAndTheChosenGroupsMembers) {
    EXPECT_EQ(rows(groups), (QStringList{"All", "Club", "Family"}));
    EXPECT_EQ(rows(persons), (QStringList{"Ann Able", "Bob Baker", "Cy Cole"}));
    clickRow(groups, QStringLiteral("Family"));
    EXPECT_EQ(rows(persons), QStringList{"Cy Cole"});
    clickRow(groups, QStringLiteral("All"));
    EXPECT_EQ(rows(persons).size(), 3);
}

TEST_F(Picker, AGroupChosenInTheActivePickerFillsTheFields) {
    ASSERT_TRUE(activate(&picker()));
    clickRow(groups, QStringLiteral("Club"));
    EXPECT_EQ(to(), QStringLiteral("Club"));
    EXPECT_EQ(name(), QStringLiteral("Club"));
    // The fields were set by the controller, which is no edit: the group stays chosen.
    EXPECT_EQ(pending(), (QStringList{"Ann", "Bob"}));
}

TEST_F(Picker, AGroupChosenWhileThePickerIsNotKeyLeavesTheFields) {
    window->setTo(QStringLiteral("kept@example.org"));
    window->setName(QStringLiteral("Kept"));
    ASSERT_TRUE(activate(window.get()));
    ASSERT_FALSE(picker().isActiveWindow());
    QSignalSpy spy(&picker(), &PeoplePicker::groupSelectionChanged);
    groups->findItems(QStringLiteral("Club"), Qt::MatchExactly).constFirst()->setSelected(true);
    ASSERT_EQ(spy.size(), 1);
    EXPECT_FALSE(spy.constFirst().at(1).toBool());
    EXPECT_EQ(pending(), (QStringList{"Ann", "Bob"}));
    EXPECT_EQ(to(), QStringLiteral("kept@example.org"));
    EXPECT_EQ(name(), QStringLiteral("Kept"));
}

TEST_F(Picker, OfSeveralGroupsOnlyTheFirstCounts) {
    ASSERT_TRUE(activate(&picker()));
    QSignalSpy spy(&picker(), &PeoplePicker::groupSelectionChanged);
    clickRow(groups, QStringLiteral("Family"));
    clickRow(groups, QStringLiteral("Club"), Qt::ControlModifier);
    ASSERT_EQ(spy.size(), 2);
    // In the picker's order, whatever the order of the clicks.
    const QList<qint64> ids = spy.last().at(0).value<QList<qint64>>();
    EXPECT_EQ(ids, (QList<qint64>{book->groupNamed(QStringLiteral("Club"))->id,
                                  book->groupNamed(QStringLiteral("Family"))->id}));
    EXPECT_EQ(pending(), (QStringList{"Ann", "Bob"}));
    EXPECT_EQ(rows(persons), (QStringList{"Ann Able", "Bob Baker"}));
}

TEST_F(Picker, APersonChosenInTheActivePickerIsOneMessage) {
    controller().selection().setPeople(book->persons());
    ASSERT_TRUE(activate(&picker()));
    clickRow(persons, QStringLiteral("Ann Able"));
    EXPECT_FALSE(controller().getPeople().has_value());
    EXPECT_EQ(name(), QStringLiteral("Ann Able"));
    EXPECT_EQ(to(), QStringLiteral("ann@example.org")); // the primary address
    EXPECT_EQ(rows(addresses), (QStringList{"ann@example.org", "ann@work.example"}));

    clickRow(addresses, QStringLiteral("ann@work.example"));
    EXPECT_EQ(to(), QStringLiteral("ann@work.example"));
    EXPECT_EQ(picker().selectedValues(), QStringList{"ann@work.example"});
}

TEST_F(Picker, APersonChosenWhileThePickerIsNotKeyOnlyDropsTheSelection) {
    controller().selection().setPeople(book->persons());
    window->setTo(QStringLiteral("kept@example.org"));
    window->setName(QStringLiteral("Kept"));
    ASSERT_TRUE(activate(window.get()));
    persons->findItems(QStringLiteral("Bob Baker"), Qt::MatchExactly)
        .constFirst()
        ->setSelected(true);
    EXPECT_FALSE(controller().getPeople().has_value());
    EXPECT_EQ(to(), QStringLiteral("kept@example.org"));
    EXPECT_EQ(name(), QStringLiteral("Kept"));
}

TEST_F(Picker, EditingTheShownAddressesTellsTheDisplayedPropertyChanged) {
    ASSERT_TRUE(activate(&picker()));
    clickRow(persons, QStringLiteral("Bob Baker"));
    QSignalSpy spy(&picker(), &PeoplePicker::displayedPropertyChanged);
    Person changed = *book->person(bob);
    changed.emails = {QStringLiteral("bob@new.example")};
    book->updatePerson(changed);
    picker().reload();
    ASSERT_EQ(spy.size(), 1);
    EXPECT_EQ(to(), QStringLiteral("bob@new.example"));
    picker().reload(); // nothing changed this time
    EXPECT_EQ(spy.size(), 1);
}

TEST_F(Picker, ReloadingKeepsTheSelectionWithoutChoosingAnew) {
    clickRow(groups, QStringLiteral("Club"));
    clickRow(persons, QStringLiteral("Bob Baker"));
    QSignalSpy groupSpy(&picker(), &PeoplePicker::groupSelectionChanged);
    QSignalSpy nameSpy(&picker(), &PeoplePicker::nameSelectionChanged);
    addPerson("Dee", "Dunn", {"dee@example.org"}, {QStringLiteral("Club")});
    picker().reload();
    EXPECT_EQ(rows(persons), (QStringList{"Ann Able", "Bob Baker", "Dee Dunn"}));
    EXPECT_EQ(picker().selectedRecords(), QList<qint64>{bob});
    EXPECT_EQ(groupSpy.size(), 0);
    EXPECT_EQ(nameSpy.size(), 0);
}

TEST_F(Picker, NewGroupAsksForItsName) {
    child<QPushButton>("newGroup", &picker())->click();
    auto* dialog = child<QInputDialog>("groupNameDialog", &picker());
    ASSERT_NE(dialog, nullptr);
    dialog->setTextValue(QStringLiteral("Chess"));
    dialog->accept();
    EXPECT_EQ(rows(groups), (QStringList{"All", "Chess", "Club", "Family"}));
}

TEST_F(Picker, ARefusedGroupNameIsExplained) {
    child<QPushButton>("newGroup", &picker())->click();
    auto* dialog = child<QInputDialog>("groupNameDialog", &picker());
    ASSERT_NE(dialog, nullptr);
    dialog->setTextValue(QStringLiteral("club"));
    dialog->accept();
    auto* box = picker().findChild<QMessageBox*>();
    ASSERT_NE(box, nullptr);
    EXPECT_TRUE(box->informativeText().contains(QStringLiteral("already a group")));
    EXPECT_EQ(rows(groups), (QStringList{"All", "Club", "Family"}));
}

TEST_F(Picker, DeletingAGroupIsConfirmedAndKeepsItsMembers) {
    clickRow(groups, QStringLiteral("Club"));
    child<QPushButton>("deleteGroup", &picker())->click();
    auto* box = picker().findChild<QMessageBox*>();
    ASSERT_NE(box, nullptr);
    QAbstractButton* confirm = nullptr;
    for (QAbstractButton* button : box->buttons())
        if (box->buttonRole(button) == QMessageBox::DestructiveRole)
            confirm = button;
    ASSERT_NE(confirm, nullptr);
    confirm->click();
    EXPECT_EQ(rows(groups), (QStringList{"All", "Family"}));
    EXPECT_EQ(book->persons().size(), 3);
}

TEST_F(Picker, ThePersonDialogKeepsWhatWasTypedWhenTheBookRefusesIt) {
    clickRow(groups, QStringLiteral("Family"));
    child<QPushButton>("newPerson", &picker())->click();
    auto* dialog = picker().findChild<PersonDialog*>();
    ASSERT_NE(dialog, nullptr);
    QTest::keyClicks(child<QLineEdit>("firstName", dialog), QStringLiteral("Dee"));
    QTest::keyClicks(child<QLineEdit>("lastName", dialog), QStringLiteral("Dunn"));
    dialog->addAddress(QStringLiteral("dee at example.org"));
    dialog->addAddress(QStringLiteral("dee@example.org"));
    dialog->accept();
    EXPECT_TRUE(dialog->isVisible());
    auto* box = dialog->findChild<QMessageBox*>();
    ASSERT_NE(box, nullptr);
    EXPECT_TRUE(box->informativeText().contains(QStringLiteral("dee at example.org")));
    EXPECT_EQ(book->persons().size(), 3);

    child<QTableWidget>("addresses", dialog)
        ->item(0, 1)
        ->setText(QStringLiteral("dee@home.example"));
    dialog->accept();
    const QList<Person> members = *book->members(book->groupNamed(QStringLiteral("Family"))->id);
    ASSERT_EQ(members.size(), 2);
    EXPECT_EQ(members.at(1).fullName(), QStringLiteral("Dee Dunn"));
    EXPECT_EQ(members.at(1).emails, (QStringList{"dee@home.example", "dee@example.org"}));
    EXPECT_EQ(members.at(1).primaryEmail(), QStringLiteral("dee@home.example"));
    EXPECT_EQ(rows(persons), (QStringList{"Cy Cole", "Dee Dunn"}));
}

TEST_F(Picker, ThePersonDialogEditsAddressesPrimaryAndGroups) {
    PersonDialog dialog(*book, *book->person(ann), 0, &picker());
    auto* table = child<QTableWidget>("addresses", &dialog);
    ASSERT_EQ(table->rowCount(), 2);
    static_cast<QAbstractButton*>(table->cellWidget(1, 0))->click();
    auto* groupList = child<QListWidget>("groups", &dialog);
    groupList->findItems(QStringLiteral("Family"), Qt::MatchExactly)
        .constFirst()
        ->setCheckState(Qt::Checked);
    groupList->findItems(QStringLiteral("Club"), Qt::MatchExactly)
        .constFirst()
        ->setCheckState(Qt::Unchecked);
    dialog.accept();
    const Person saved = *book->person(ann);
    EXPECT_EQ(saved.primaryEmail(), QStringLiteral("ann@work.example"));
    QStringList memberOf;
    for (const Group& group : book->groupsOf(ann))
        memberOf << group.name;
    EXPECT_EQ(memberOf, QStringList{"Family"});
}

TEST_F(Picker, DeletingPersonsIsConfirmed) {
    clickRow(persons, QStringLiteral("Ann Able"));
    clickRow(persons, QStringLiteral("Cy Cole"), Qt::ControlModifier);
    child<QPushButton>("deletePerson", &picker())->click();
    auto* box = picker().findChild<QMessageBox*>();
    ASSERT_NE(box, nullptr);
    EXPECT_TRUE(box->text().contains(QStringLiteral("2")));
    box->button(QMessageBox::Cancel)->click();
    EXPECT_EQ(book->persons().size(), 3);
}

} // namespace
