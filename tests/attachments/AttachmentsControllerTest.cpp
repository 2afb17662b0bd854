#include "attachments/AttachmentsController.h"

#include "DesktopStandIn.h"

#include <QMimeData>
#include <gtest/gtest.h>

// The drops, moves, removals and openings the table asks for are played through the window
// in tests/gui; these are the calls it never makes, which must still leave the list sound.
TEST(Attachments, RowsOutsideTheListAreSafe) {
    AttachmentsController list;
    list.addFiles({"/a b", "/c", "/d"});
    QMimeData file;
    file.setUrls({QUrl::fromLocalFile("/x")});
    EXPECT_TRUE(list.acceptDrop(AttachmentsController::readDrag(file), 9)); // appended
    list.deleteButtonClicked({1, 1, 9, -1});                                // row 1 once
    EXPECT_EQ(list.getAttachments(), (QStringList{"/a b", "/d", "/x"}));
    DesktopStandIn desktop;
    EXPECT_FALSE(list.openAttachment(-1)); // no selection
    EXPECT_FALSE(list.openAttachment(3));
    EXPECT_TRUE(list.openAttachment(0));
    EXPECT_EQ(desktop.opened, QList<QUrl>{QUrl::fromLocalFile("/a b")});
}
