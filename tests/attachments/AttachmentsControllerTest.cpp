#include "attachments/AttachmentsController.h"

#include "DesktopStandIn.h"
#include "RowName.h"

#include <QMimeData>
#include <QUrl>

namespace {

using Controller = AttachmentsController;

// The list /a /b /c /d, put in by addFiles; the changes it tells of are counted from then on.
class Attachments : public ::testing::Test {
protected:
    Attachments() {
        list.addFiles({"/a", "/b", "/c", "/d"});
        QObject::connect(&list, &Controller::attachmentsChanged, [this] { ++changes; });
    }
    QString shown() const { return list.getAttachments().join(' '); }
    Controller list;
    int changes = 0;
};

// A drag as the table hands it over, judged and then dropped at insertion row at: rows in the
// private type, file URLs ("/" is a folder, the others do not exist), or both; junk is private
// data that is no index set.
struct DropRow {
    std::string name;
    QList<int> rows;
    QStringList urls;
    int at;
    QString expected;
    bool taken, onRow = false, junk = false;
    friend void PrintTo(const DropRow& row, std::ostream* out) { *out << row.name; }
};

class Drop : public Attachments, public ::testing::WithParamInterface<DropRow> {};

TEST_P(Drop, Lands) {
    const DropRow& row = GetParam();
    auto data =
        row.rows.isEmpty() ? std::make_unique<QMimeData>() : Controller::rowDragData(row.rows);
    if (row.junk)
        data->setData(Controller::privateDragType, "not an index set");
    data->setUrls(QUrl::fromStringList(row.urls));
    const Controller::Drag drag = Controller::readDrag(*data);
    EXPECT_EQ(Controller::validateDrop(drag.firstFile(), row.onRow) != 0 &&
                  list.acceptDrop(drag, row.at),
              row.taken);
    EXPECT_EQ(shown(), row.expected);
    EXPECT_EQ(changes, (shown() == "/a /b /c /d" ? 0 : 1));
}

INSTANTIATE_TEST_SUITE_P(
    Rows, Drop,
    ::testing::Values(
        // Each file goes in at the same index, so several land in reverse order.
        DropRow{"files", {}, {"file:///x", "file:///y"}, 1, "/a /y /x /b /c /d", true},
        DropRow{"below_last", {}, {"file:///x"}, -1, "/a /b /c /d /x", true},
        DropRow{"beyond_end", {}, {"file:///x"}, 9, "/a /b /c /d /x", true},
        DropRow{"duplicate", {}, {"file:///a"}, 0, "/a /a /b /c /d", true},
        DropRow{"web_left_out", {}, {"https://e.org/p", "file:///x"}, 4, "/a /b /c /d /x", true},
        DropRow{"web_only", {}, {"https://e.org/p"}, 0, "/a /b /c /d", false},
        // Only the first file is judged: a folder after it comes along.
        DropRow{"folder_first", {}, {"file:///", "file:///x"}, 0, "/a /b /c /d", false},
        DropRow{"folder_second", {}, {"file:///x", "file:///"}, 0, "/ /x /a /b /c /d", true},
        DropRow{"file_onto_row", {}, {"file:///x"}, 0, "/a /b /c /d", false, true},
        // A row lands above the drop point; of several rows only the first moves.
        DropRow{"down", {0}, {}, 3, "/b /c /a /d", true},
        DropRow{"up", {2}, {}, 0, "/c /a /b /d", true},
        DropRow{"first_of_two", {3, 1}, {}, 0, "/b /a /c /d", true},
        DropRow{"to_end", {0}, {}, 4, "/b /c /d /a", true},
        DropRow{"row_below_last", {0}, {}, -1, "/b /c /d /a", true},
        DropRow{"own_place", {1}, {}, 1, "/a /b /c /d", true},
        DropRow{"after_itself", {1}, {}, 2, "/a /b /c /d", true},
        DropRow{"stale_row", {7}, {}, 0, "/a /b /c /d", true},
        DropRow{"row_onto_row", {0}, {}, 3, "/a /b /c /d", false, true},
        DropRow{"rows_before_urls", {2}, {"file:///x"}, 0, "/c /a /b /d", true},
        DropRow{"junk", {}, {}, 0, "/a /b /c /d", false, false, true}),
    RowName());

TEST_F(Attachments, DeleteTakesTheSelectedRowsOrAll) {
    list.deleteButtonClicked({2, 0});
    EXPECT_EQ(shown(), "/b /d");
    list.deleteButtonClicked({1, 1, 9, -1});
    EXPECT_EQ(shown(), "/b");
    list.deleteButtonClicked({});
    EXPECT_EQ(shown(), "");
    EXPECT_EQ(changes, 3);
}

TEST_F(Attachments, OpenHandsARowToTheDesktop) {
    list.addFiles({"/home/ada/b c.pdf"});
    DesktopStandIn desktop;
    EXPECT_FALSE(list.openAttachment(-1)); // no selection
    EXPECT_FALSE(list.openAttachment(5));
    EXPECT_TRUE(list.openAttachment(4));
    EXPECT_EQ(desktop.opened, QList<QUrl>{QUrl::fromLocalFile("/home/ada/b c.pdf")});
}

} // namespace
