#include "attachments/AttachmentsController.h"

#include "DesktopStandIn.h"
#include "RowName.h"

#include <QDir>
#include <QFile>
#include <QMimeData>
#include <QTemporaryDir>
#include <QUrl>
#include <gtest/gtest.h>

namespace {

using Controller = AttachmentsController;

// A drag as the table would hand it over: real QMimeData, read by the controller.
Controller::Drag fileDrag(const QStringList& paths) {
    QMimeData data;
    QList<QUrl> urls;
    for (const QString& path : paths)
        urls += QUrl::fromLocalFile(path);
    data.setUrls(urls);
    return Controller::readDrag(data);
}

Controller::Drag rowDrag(const QList<int>& rows) {
    return Controller::readDrag(*Controller::rowDragData(rows));
}

class Attachments : public ::testing::Test {
protected:
    Attachments() {
        QObject::connect(&controller, &Controller::attachmentsChanged, [this] { ++changes; });
    }

    // One file at a time at the end, so that the list is in the given order.
    void fill(const QStringList& paths) {
        for (const QString& path : paths)
            ASSERT_TRUE(controller.acceptDrop(fileDrag({path}), -1));
        changes = 0;
    }

    Controller controller;
    int changes = 0;
};

TEST(AttachmentsDrag, RowDragCarriesTheRowsAsAnIndexSet) {
    const std::unique_ptr<QMimeData> data = Controller::rowDragData({3, 1, 3});
    EXPECT_EQ(Controller::privateDragType, QStringLiteral("MyPrivateTableViewDataType"));
    EXPECT_TRUE(data->hasFormat(QStringLiteral("MyPrivateTableViewDataType")));
    const Controller::Drag drag = Controller::readDrag(*data);
    EXPECT_TRUE(drag.isRowDrag);
    EXPECT_EQ(drag.rows, (QList<int>{1, 3}));
    EXPECT_TRUE(drag.files.isEmpty());
    EXPECT_FALSE(drag.firstFile());
}

TEST(AttachmentsDrag, FileDragKeepsLocalFilesInOrder) {
    QMimeData data;
    data.setUrls({QUrl::fromLocalFile(QStringLiteral("/tmp/b b.txt")),
                  QUrl(QStringLiteral("https://example.org/page.html")),
                  QUrl::fromLocalFile(QStringLiteral("/tmp/a.txt"))});
    const Controller::Drag drag = Controller::readDrag(data);
    EXPECT_FALSE(drag.isRowDrag);
    EXPECT_EQ(drag.files,
              (QStringList{QStringLiteral("/tmp/b b.txt"), QStringLiteral("/tmp/a.txt")}));
    EXPECT_EQ(drag.firstFile(), QStringLiteral("/tmp/b b.txt"));
}

TEST(AttachmentsDrag, PrivateTypeComesFirst) {
    const std::unique_ptr<QMimeData> data = Controller::rowDragData({2});
    data->setUrls({QUrl::fromLocalFile(QStringLiteral("/tmp/a.txt"))});
    const Controller::Drag drag = Controller::readDrag(*data);
    EXPECT_TRUE(drag.isRowDrag);
    EXPECT_EQ(drag.rows, QList<int>{2});
}

struct VerdictRow {
    std::string name;
    std::optional<QString> firstFile; // relative to a folder holding "file.txt" and "folder"
    bool dropOnRow;
    unsigned expected;

    // Names the row in test listings instead of a byte dump.
    friend void PrintTo(const VerdictRow& row, std::ostream* out) { *out << row.name; }
};

class DropVerdict : public ::testing::TestWithParam<VerdictRow> {};

TEST_P(DropVerdict, FollowsTheFirstFile) {
    QTemporaryDir dir;
    QFile file(dir.filePath(QStringLiteral("file.txt")));
    ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    ASSERT_TRUE(QDir(dir.path()).mkdir(QStringLiteral("folder")));
    std::optional<QString> path;
    if (GetParam().firstFile)
        path = dir.filePath(*GetParam().firstFile);
    EXPECT_EQ(Controller::validateDrop(path, GetParam().dropOnRow), GetParam().expected);
}

INSTANTIATE_TEST_SUITE_P(
    Rows, DropVerdict,
    ::testing::Values(
        VerdictRow{"file_between_rows", QStringLiteral("file.txt"), false,
                   Controller::dragOperationEvery},
        VerdictRow{"file_onto_a_row", QStringLiteral("file.txt"), true,
                   Controller::dragOperationNone},
        VerdictRow{"row_drag_between_rows", std::nullopt, false, Controller::dragOperationEvery},
        VerdictRow{"row_drag_onto_a_row", std::nullopt, true, Controller::dragOperationNone},
        VerdictRow{"folder", QStringLiteral("folder"), false, Controller::dragOperationNone},
        VerdictRow{"missing_file", QStringLiteral("gone.txt"), false,
                   Controller::dragOperationEvery}),
    RowName());

TEST(AttachmentsDrag, OnlyTheFirstFileOfAMultiFileDragIsExamined) {
    QTemporaryDir dir;
    const QString folder = dir.filePath(QStringLiteral("folder"));
    const QString file = dir.filePath(QStringLiteral("file.txt"));
    ASSERT_TRUE(QDir().mkdir(folder));
    QFile(file).open(QIODevice::WriteOnly);

    const Controller::Drag folderFirst = fileDrag({folder, file});
    EXPECT_EQ(Controller::validateDrop(folderFirst.firstFile(), false),
              Controller::dragOperationNone);

    const Controller::Drag folderSecond = fileDrag({file, folder});
    EXPECT_EQ(Controller::validateDrop(folderSecond.firstFile(), false),
              Controller::dragOperationEvery);
    Controller controller;
    EXPECT_TRUE(controller.acceptDrop(folderSecond, 0));
    EXPECT_EQ(controller.getAttachments(), (QStringList{folder, file}));
}

struct MoveRow {
    std::string name;
    QList<int> dragged;
    int row;
    QStringList expected;

    // Names the row in test listings instead of a byte dump.
    friend void PrintTo(const MoveRow& row, std::ostream* out) { *out << row.name; }
};

class RowMove : public Attachments, public ::testing::WithParamInterface<MoveRow> {};

TEST_P(RowMove, MovesOnlyTheFirstDraggedRow) {
    const QStringList start = {"a", "b", "c", "d"};
    fill(start);
    EXPECT_TRUE(controller.acceptDrop(rowDrag(GetParam().dragged), GetParam().row));
    EXPECT_EQ(controller.getAttachments(), GetParam().expected);
    EXPECT_EQ(changes, GetParam().expected == start ? 0 : 1);
}

INSTANTIATE_TEST_SUITE_P(
    Rows, RowMove,
    ::testing::Values(MoveRow{"row_0_to_point_3", {0}, 3, {"b", "c", "a", "d"}},
                      MoveRow{"row_2_to_point_0", {2}, 0, {"c", "a", "b", "d"}},
                      MoveRow{"rows_1_and_3_move_only_row_1", {3, 1}, 0, {"b", "a", "c", "d"}},
                      MoveRow{"row_0_to_the_end", {0}, 4, {"b", "c", "d", "a"}},
                      MoveRow{"row_0_below_the_last_row", {0}, -1, {"b", "c", "d", "a"}},
                      MoveRow{"onto_its_own_place", {1}, 1, {"a", "b", "c", "d"}},
                      MoveRow{"just_after_itself", {1}, 2, {"a", "b", "c", "d"}},
                      MoveRow{"stale_row", {7}, 0, {"a", "b", "c", "d"}}),
    RowName());

TEST_F(Attachments, UnreadableRowDragIsRefused) {
    fill({"a", "b"});
    QMimeData data;
    data.setData(Controller::privateDragType, "not an index set");
    const Controller::Drag drag = Controller::readDrag(data);
    EXPECT_TRUE(drag.isRowDrag);
    EXPECT_TRUE(drag.rows.isEmpty());
    EXPECT_FALSE(controller.acceptDrop(drag, 0));
    EXPECT_EQ(controller.getAttachments(), (QStringList{"a", "b"}));
    EXPECT_EQ(changes, 0);
}

TEST_F(Attachments, DroppedFilesLandReversedAtTheDropPoint) {
    fill({"/x", "/y"});
    EXPECT_TRUE(controller.acceptDrop(fileDrag({"/a", "/b", "/c"}), 1));
    EXPECT_EQ(controller.getAttachments(), (QStringList{"/x", "/c", "/b", "/a", "/y"}));
    EXPECT_EQ(changes, 1);
}

TEST_F(Attachments, DuplicatesAreNotFiltered) {
    fill({"/x"});
    EXPECT_TRUE(controller.acceptDrop(fileDrag({"/x"}), 0));
    EXPECT_EQ(controller.getAttachments(), (QStringList{"/x", "/x"}));
}

TEST_F(Attachments, DropWithoutFilesInsertsNothing) {
    fill({"/x"});
    QMimeData data;
    data.setUrls({QUrl(QStringLiteral("https://example.org/"))});
    EXPECT_FALSE(controller.acceptDrop(Controller::readDrag(data), 0));
    EXPECT_EQ(controller.getAttachments(), QStringList{"/x"});
    EXPECT_EQ(changes, 0);
}

TEST_F(Attachments, DeleteRemovesTheSelectedRows) {
    fill({"a", "b", "c", "d"});
    controller.deleteButtonClicked({2, 0});
    EXPECT_EQ(controller.getAttachments(), (QStringList{"b", "d"}));
    EXPECT_EQ(changes, 1);
    controller.deleteButtonClicked({1, 1, 9, -1});
    EXPECT_EQ(controller.getAttachments(), QStringList{"b"});
}

TEST_F(Attachments, DeleteWithNoSelectionEmptiesTheList) {
    fill({"a", "b", "c"});
    controller.deleteButtonClicked({});
    EXPECT_TRUE(controller.getAttachments().isEmpty());
    EXPECT_EQ(changes, 1);
}

TEST_F(Attachments, OpenHandsTheFileToTheDesktop) {
    fill({"/home/ada/a.pdf", "/home/ada/b c.pdf"});
    DesktopStandIn desktop;
    EXPECT_TRUE(controller.openAttachment(1));
    EXPECT_EQ(desktop.opened,
              QList<QUrl>{QUrl::fromLocalFile(QStringLiteral("/home/ada/b c.pdf"))});
}

TEST_F(Attachments, OpenWithoutARowIsIgnored) {
    fill({"/home/ada/a.pdf"});
    DesktopStandIn desktop;
    EXPECT_FALSE(controller.openAttachment(-1));
    EXPECT_FALSE(controller.openAttachment(1));
    EXPECT_TRUE(desktop.opened.isEmpty());
}

} // namespace
