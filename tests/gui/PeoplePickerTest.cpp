#include "GuiFixture.h"
#include "controller/RecipientSelection.h"
#include "gui/PersonDialog.h"

#include <QDir>
#include <QDropEvent>
#include <QFileDialog>
#include <QInputDialog>
#include <QMenu>
#include <QMimeData>
#include <QSignalSpy>
#include <QTableWidget>

namespace {

// Ann Able (two addresses) and Bob Baker in Club, Cy Cole in Family.
class Picker : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        book->addMember(
            book->addGroup("Club"),
            book->addPerson({0, "Ann", "Able", {"ann@example.org", "ann@work.example"}, 0}));
        bob = addPerson("Bob", "Baker", "Club");
        addPerson("Cy", "Cole", "Family");
        picker().reload();
        picker().show();
    }
    QListWidget* list(const char* name) const { return child<QListWidget>(name, &picker()); }
    QString rows(const char* name) const {
        QStringList texts;
        for (int row = 0; row < list(name)->count(); ++row)
            texts << list(name)->item(row)->text();
        return texts.join(", ");
    }
    QString pending() const {
        QStringList names;
        for (const Person& person : pelmo->getPeople().value_or(QList<Person>()))
            names << person.firstName;
        return pelmo->getPeople() ? names.join(' ') : "none";
    }
    // Presses button and answers what it asks: a name, or the box's button of that text; tells
    // what was asked.
    QString answer(const char* button, const QString& reply) {
        child<QPushButton>(button, &picker())->click();
        QString told;
        if (auto* dialog = asked<QInputDialog>()) {
            told = dialog->textValue();
            dialog->setTextValue(reply);
            dialog->accept();
        } else if (auto* box = asked<QMessageBox>()) {
            // Return must never delete: the question's default is Cancel.
            told = box->text() + (box->defaultButton()->text() == "Cancel" ? "" : " (no Cancel)");
            for (QAbstractButton* choice : box->buttons())
                if (choice->text() == reply)
                    choice->click();
        }
        return told;
    }
    qint64 bob = 0;
};

// A choice made while the picker is the active window fills To and Name; made while another
// window is (a script choosing, the book changing), it changes only who is mailed. Of several
// groups (Ctrl adds one to the choice) the first in the list counts, whatever the click order.
TEST_F(Picker, TheActiveWindowDecidesWhatAChoiceFillsAndAReloadKeepsIt) {
    const struct {
        bool inPicker;
        const char* list;
        QString item, shown;
        Qt::KeyboardModifiers keys = {};
    } choices[] = {
        {false, "groups", "Family", "kept / Kept / Cy"},
        {true, "groups", "Club", "Club / Club / Ann Bob", Qt::ControlModifier},
        {true, "persons", "Ann Able", "ann@example.org / Ann Able / none"},
        {true, "addresses", "ann@work.example", "ann@work.example / Ann Able / none"},
        {false, "persons", "Bob Baker", "kept / Kept / none"},
    };
    // Nothing is chosen before the user chooses, so that a first click on any row is a choice.
    EXPECT_EQ(list("groups")->selectedItems().size() + list("persons")->selectedItems().size(), 0);
    for (const auto& choice : choices) {
        pelmo->selection().setPeople(book->persons());
        window->setTo("kept");
        window->setName("Kept");
        QWidget* active = choice.inPicker ? static_cast<QWidget*>(&picker()) : window.get();
        choice.inPicker ? child<QAction>("addressesAction")->trigger() : window->activateWindow();
        ASSERT_TRUE(waitUntil([active] { return active->isActiveWindow(); }));
        clickRow(list(choice.list), choice.item, choice.keys);
        EXPECT_EQ(window->to() + " / " + window->name() + " / " + pending(), choice.shown);
    }
    // Only the user's edits of To or Name, not the program's, drop the group chosen.
    for (const char* field : {"subject", "webPageOrFile", "to", "name"}) {
        pelmo->selection().setPeople({});
        QTest::keyClicks(child<QLineEdit>(field), "x");
        EXPECT_EQ(pending(), QString("to name").contains(field) ? "none" : "") << field;
    }
    // A reload keeps the choice, Club shown (now with Dee, listed by last name like the whole
    // book, though the last to join) and Bob chosen in it, and tells only of an address that
    // changed.
    child<QAction>("addressesAction")->trigger();
    ASSERT_TRUE(waitUntil([this] { return picker().isActiveWindow(); }));
    clickRow(list("persons"), "Bob Baker");
    QSignalSpy changed(&picker(), &PeoplePicker::displayedPropertyChanged);
    addPerson("Dee", "Aaron", "Club");
    picker().reload();
    book->updatePerson({bob, "Bob", "Baker", {"bob@new.example"}, 0});
    picker().reload();
    EXPECT_EQ(rows("persons"), "Dee Aaron, Ann Able, Bob Baker");
    EXPECT_EQ(QString::number(changed.size()) + " " + window->to(), "1 bob@new.example");
}

TEST_F(Picker, EditingGroupsAndPersonsAsksFirst) {
    EXPECT_EQ(answer("newGroup", "Chess"), "");
    EXPECT_EQ(answer("newGroup", "club"), "");
    EXPECT_EQ(asked<QMessageBox>()->informativeText(), "There is already a group named \"Club\".");
    asked<QMessageBox>()->accept();
    clickRow(list("groups"), "Club");
    EXPECT_EQ(answer("renameGroup", "Bridge"), "Club");
    clickRow(list("persons"), "Ann Able");
    clickRow(list("persons"), "Bob Baker", Qt::ControlModifier);
    EXPECT_EQ(answer("deletePerson", "Cancel"), "Delete 2 persons from the address book?");
    EXPECT_EQ(answer("deleteGroup", "Delete Group"), "Delete the group \"Bridge\"?");
    // Its members stay in the book.
    EXPECT_EQ(rows("groups") + " / " + rows("persons"),
              "All, Chess, Family / Ann Able, Bob Baker, Cy Cole");
    clickRow(list("persons"), "Cy Cole");
    EXPECT_EQ(answer("deletePerson", "Delete"), "Delete \"Cy Cole\" from the address book?");
    EXPECT_EQ(rows("persons"), "Ann Able, Bob Baker");
}

// The membership menu offers every group, and leaving the group shown.
TEST_F(Picker, MembershipMenu) {
    auto* menu = child<QPushButton>("membership", &picker())->menu();
    const auto offered = [menu] {
        Q_EMIT menu->aboutToShow();
        QStringList texts;
        for (QAction* action : menu->actions())
            texts << action->text();
        return texts.join(", ");
    };
    clickRow(list("persons"), "Cy Cole");
    EXPECT_EQ(offered(), "Add to \"Club\", Add to \"Family\"");
    clickRow(list("groups"), "Club");
    clickRow(list("persons"), "Bob Baker");
    EXPECT_EQ(offered(), "Add to \"Club\", Add to \"Family\", , Remove from \"Club\"");
    menu->actions().last()->trigger();
    EXPECT_EQ(rows("persons"), "Ann Able");
}

TEST_F(Picker, ThePersonDialogSavesOnlyWhatTheBookTakes) {
    clickRow(list("groups"), "Family");
    child<QPushButton>("newPerson", &picker())->click();
    auto* dialog = asked<PersonDialog>();
    QTest::keyClicks(child<QLineEdit>("firstName", dialog), "Dee");
    QTest::keyClicks(child<QLineEdit>("lastName", dialog), "Dunn");
    dialog->addAddress("dee at example.org");
    dialog->addAddress("dee@example.org");
    dialog->accept();
    // Refused: the dialog stays with what was typed, and tells why.
    ASSERT_TRUE(dialog->isVisible());
    EXPECT_TRUE(asked<QMessageBox>()->informativeText().contains("dee at example.org"));
    asked<QMessageBox>()->accept();
    child<QTableWidget>("addresses", dialog)->item(0, 1)->setText("dee@home.example");
    dialog->accept();
    // Made while Family is shown, Dee joins it.
    EXPECT_EQ(rows("persons"), "Cy Cole, Dee Dunn");
    const Person dee = book->members(book->groupNamed("Family")->id)->at(1);
    EXPECT_EQ(dee.emails.join(' ') + " / " + dee.primaryEmail(),
              "dee@home.example dee@example.org / dee@home.example");

    // Opened again from the list: the second address made primary, Family left.
    clickRow(list("persons"), "Dee Dunn");
    QTest::mouseDClick(list("persons")->viewport(), Qt::LeftButton, {},
                       list("persons")->visualItemRect(list("persons")->item(1)).center());
    dialog = asked<PersonDialog>();
    qobject_cast<QAbstractButton*>(child<QTableWidget>("addresses", dialog)->cellWidget(1, 0))
        ->click();
    for (QListWidgetItem* group :
         child<QListWidget>("groups", dialog)->findItems("", Qt::MatchContains))
        group->setCheckState(group->checkState() ? Qt::Unchecked : Qt::Checked);
    dialog->accept();
    EXPECT_EQ(rows("persons") + " / " + book->person(dee.id)->primaryEmail(),
              "Cy Cole / dee@example.org");
}

// The search keeps the persons any part of whose names or addresses holds every word typed.
// Files dropped on the window are imported, each with its counts and what it left out;
// File ▸ Export Contacts… writes the group shown.
TEST_F(Picker, SearchDropAndExport) {
    for (const auto& [query, shown] : {std::pair{"", "Ann Able, Bob Baker, Cy Cole"},
                                       {"work.EXAMPLE", "Ann Able"},
                                       {"bak example.org", "Bob Baker"},
                                       {"zed", ""}}) {
        child<QLineEdit>("search", &picker())->setText(query);
        EXPECT_EQ(rows("persons"), shown) << query;
    }
    child<QLineEdit>("search", &picker())->clear();

    QMimeData files;
    files.setUrls({QUrl::fromLocalFile(PELMO_TEST_DATA "/import/bad-values.vcf"),
                   QUrl::fromLocalFile(PELMO_TEST_DATA "/import/sniffed.txt"),
                   QUrl::fromLocalFile(PELMO_TEST_DATA "/import/halfway.csv")});
    QDragEnterEvent enter(QPoint(10, 10), Qt::CopyAction, &files, Qt::LeftButton, {});
    QDropEvent drop(QPointF(10, 10), Qt::CopyAction, &files, Qt::LeftButton, {});
    QCoreApplication::sendEvent(&picker(), &enter);
    QCoreApplication::sendEvent(&picker(), &drop);
    auto* summary = picker().findChild<QMessageBox*>("importSummary");
    ASSERT_NE(summary, nullptr);
    // Only the contact files: a .txt dropped with them is not imported.
    EXPECT_EQ(summary->text(),
              "Imported bad-values.vcf: 2 persons added, 0 updated, 1 skipped; 1 new group.\n"
              "Imported halfway.csv: 2 persons added, 0 updated, 1 skipped; 0 new groups.");
    EXPECT_EQ(summary->detailedText().count('\n') + 1, 4);
    EXPECT_TRUE(summary->detailedText().startsWith(
        "bad-values.vcf, line 5: \"ada at work\" is not an e-mail address (skipped)"));
    summary->accept();
    EXPECT_EQ(rows("persons"),
              "Ann Able, Bob Baker, Cy Cole, Irene Curie, Marie Curie, Ada Lovelace, Alan Turing");

    clickRow(list("groups"), "Club");
    child<QAction>("exportContactsAction")->trigger();
    auto* dialog = asked<QFileDialog>();
    ASSERT_NE(dialog, nullptr);
    const QString path = QDir(folder.path()).filePath("club.vcf");
    dialog->selectFile(path);
    QMetaObject::invokeMethod(dialog, "accept");
    AddressBook back(QDir(folder.path()).filePath("back.sqlite"));
    EXPECT_EQ(back.importFile(path).headline("club.vcf"),
              "Imported club.vcf: 2 persons added, 0 updated, 0 skipped; 1 new group.");
}

// A person another program adds to the same file shows without a restart.
TEST_F(Picker, ShowsWhatAnotherProgramAdds) {
    AddressBook other(book->path());
    other.addPerson({0, "Dee", "Other", {"dee@example.org"}, 0});
    EXPECT_TRUE(waitUntil([this] { return rows("persons").contains("Dee Other"); }))
        << rows("persons").toStdString();
}

} // namespace
