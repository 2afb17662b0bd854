#include "gui/AttachmentsWindow.h"
#include "DesktopStandIn.h"
#include "GuiFixture.h"
#include "RowName.h"
#include "attachments/AttachmentsController.h"
#include "gui/AttachmentsModel.h"

#include <QDropEvent>
#include <QMimeData>
#include <QSignalSpy>
#include <QTableView>

namespace {

// The attachments window, opened from the main window, holding /a /b /c /d; drags are dropped
// on its table by the view's own events, as a file manager or the table itself sends them.
class AttachmentsTable : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        child<QAction>("attachmentsAction")->trigger();
        table = child<QTableView>("attachmentsTable", &window->attachmentsWindow());
        window->attachments().addFiles({"/a", "/b", "/c", "/d"});
    }
    AttachmentsModel& model() const { return window->attachmentsWindow().model(); }
    QRect rect(int row) const { return table->visualRect(model().index(row, 0)); }
    QString shown() const {
        QStringList rows;
        for (int row = 0; row < model().rowCount(); ++row)
            rows << model().index(row, 0).data().toString();
        return rows.join(' ');
    }
    QTableView* table = nullptr;
};

// Rows in the private type, file URLs ("/" is a folder, the others do not exist), or both, or
// junk in the private type; dropped at the top edge of row at, or below the last row.
struct Drop {
    std::string name;
    QList<int> rows;
    QStringList urls;
    int at;
    QString expected;
    bool taken, junk = false;
    friend void PrintTo(const Drop& row, std::ostream* out) { *out << row.name; }
};

class Drops : public AttachmentsTable, public ::testing::WithParamInterface<Drop> {};

TEST_P(Drops, Land) {
    const Drop& row = GetParam();
    auto data = row.rows.isEmpty() ? std::make_unique<QMimeData>()
                                   : AttachmentsController::rowDragData(row.rows);
    if (row.junk)
        data->setData(AttachmentsController::privateDragType, "not an index set");
    data->setUrls(QUrl::fromStringList(row.urls));
    const Qt::DropAction action = data->hasUrls() ? Qt::CopyAction : Qt::MoveAction;
    const QPoint at = rect(row.at).isValid() ? rect(row.at).topLeft() + QPoint(5, 1)
                                             : QPoint(5, table->viewport()->height() - 2);
    QDragEnterEvent enter(at, action, data.get(), Qt::LeftButton, {});
    QDropEvent dropped(at, action, data.get(), Qt::LeftButton, {});
    QSignalSpy changes(&window->attachments(), &AttachmentsController::attachmentsChanged);
    QCoreApplication::sendEvent(table->viewport(), &enter);
    QCoreApplication::sendEvent(table->viewport(), &dropped);
    EXPECT_EQ(enter.isAccepted() && dropped.isAccepted(), row.taken);
    EXPECT_EQ(shown() + " / " + QString::number(changes.size()),
              row.expected + (row.expected == "/a /b /c /d" ? " / 0" : " / 1"));
}

INSTANTIATE_TEST_SUITE_P(
    Rows, Drops,
    ::testing::Values(
        // Each file goes in at the same index, so several land in reverse order.
        Drop{"files", {}, {"file:///x", "file:///y"}, 1, "/a /y /x /b /c /d", true},
        Drop{"below_last", {}, {"file:///x"}, -1, "/a /b /c /d /x", true},
        Drop{"duplicate", {}, {"file:///a"}, 0, "/a /a /b /c /d", true},
        Drop{"web_left_out", {}, {"https://e.org/p", "file:///x"}, 3, "/a /b /c /x /d", true},
        Drop{"web_only", {}, {"https://e.org/p"}, 0, "/a /b /c /d", false},
        // Only the first file is judged: a folder after it comes along.
        Drop{"folder_first", {}, {"file:///", "file:///x"}, 0, "/a /b /c /d", false},
        Drop{"folder_second", {}, {"file:///x", "file:///"}, 0, "/ /x /a /b /c /d", true},
        // A row lands above the drop point; of several rows only the first moves.
        Drop{"down", {0}, {}, 3, "/b /c /a /d", true}, Drop{"up", {2}, {}, 0, "/c /a /b /d", true},
        Drop{"first_of_two", {3, 1}, {}, 0, "/b /a /c /d", true},
        Drop{"own_place", {1}, {}, 1, "/a /b /c /d", true},
        Drop{"rows_before_urls", {2}, {"file:///x"}, 0, "/c /a /b /d", true},
        Drop{"junk", {}, {}, 0, "/a /b /c /d", false, true}),
    RowName());

TEST_F(AttachmentsTable, RowsAreDraggedOpenedAndRemoved) {
    // The table's own drags, which never land onto a row.
    const std::unique_ptr<QMimeData> rows(model().mimeData({model().index(1, 0)}));
    EXPECT_EQ(rows->formats(), QStringList{"MyPrivateTableViewDataType"});
    EXPECT_FALSE(model().dropMimeData(rows.get(), Qt::MoveAction, -1, -1, model().index(3, 0)));
    DesktopStandIn desktop;
    // A double click is a click and then the second press, as the platform delivers it.
    QTest::mouseClick(table->viewport(), Qt::LeftButton, {}, rect(1).center());
    QTest::mouseDClick(table->viewport(), Qt::LeftButton, {}, rect(1).center());
    EXPECT_EQ(desktop.opened, QList<QUrl>{QUrl::fromLocalFile("/b")});
    QTest::mouseClick(table->viewport(), Qt::LeftButton, Qt::ControlModifier, rect(3).center());
    auto* remove = child<QPushButton>("deleteButton", &window->attachmentsWindow());
    QTest::mouseClick(remove, Qt::LeftButton);
    EXPECT_EQ(shown(), "/a /c");
    table->clearSelection();
    QTest::mouseClick(remove, Qt::LeftButton);
    EXPECT_EQ(shown(), "");
}

} // namespace
