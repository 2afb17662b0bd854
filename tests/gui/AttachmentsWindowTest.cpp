#include "gui/AttachmentsWindow.h"
#include "DesktopStandIn.h"
#include "GuiFixture.h"
#include "attachments/AttachmentsController.h"
#include "gui/AttachmentsModel.h"

#include <QDropEvent>
#include <QMimeData>
#include <QTableView>

namespace {

// The attachments window, opened from the main window, its table fed by the view's own drag
// events: file URLs as a file manager sends them, or the rows the table puts on a drag.
class AttachmentsTable : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        child<QAction>("attachmentsAction")->trigger();
        table = child<QTableView>("attachmentsTable", &window->attachmentsWindow());
    }
    AttachmentsModel& model() const { return window->attachmentsWindow().model(); }
    QRect rect(int row) const { return table->visualRect(model().index(row, 0)); }
    QString shown() const {
        QStringList rows;
        for (int row = 0; row < model().rowCount(); ++row)
            rows << model().index(row, 0).data().toString();
        return rows.join(' ');
    }
    // Drops at insertion row (the top edge of that row, or below the last) the URLs a file
    // manager sends or, with none, the table's own drag of row dragged; tells whether it took.
    bool drop(const QStringList& urls, int row, int dragged = 0) {
        std::unique_ptr<QMimeData> data(model().mimeData({model().index(dragged, 0)}));
        if (!urls.isEmpty()) {
            data = std::make_unique<QMimeData>();
            data->setUrls(QUrl::fromStringList(urls));
        }
        const Qt::DropAction action = urls.isEmpty() ? Qt::MoveAction : Qt::CopyAction;
        const QPoint at = rect(row).isValid() ? rect(row).topLeft() + QPoint(5, 1)
                                              : QPoint(5, table->viewport()->height() - 2);
        QDragEnterEvent enter(at, action, data.get(), Qt::LeftButton, {});
        QDropEvent dropped(at, action, data.get(), Qt::LeftButton, {});
        QCoreApplication::sendEvent(table->viewport(), &enter);
        QCoreApplication::sendEvent(table->viewport(), &dropped);
        return enter.isAccepted() && dropped.isAccepted();
    }
    QTableView* table = nullptr;
};

TEST_F(AttachmentsTable, DropsLandBetweenTheRows) {
    EXPECT_TRUE(drop({"file:///a", "file:///b"}, 0));
    EXPECT_FALSE(drop({"https://example.org/a.pdf"}, 0)); // neither files nor rows
    EXPECT_TRUE(drop({}, 2, 0));                          // a row, above the drop point
    // The table shows the controller's list, which every message carries.
    EXPECT_EQ(pelmo->getAttachments().getAttachments().join(' ') + " / " + shown(),
              "/a /b / /a /b");
    const std::unique_ptr<QMimeData> rows(model().mimeData({model().index(0, 0)}));
    EXPECT_EQ(rows->formats(), QStringList{"MyPrivateTableViewDataType"});
}

TEST_F(AttachmentsTable, RemoveTakesTheSelectedRowsOrAllAndDoubleClickOpensOne) {
    window->attachments().addFiles({"/a", "/b c", "/d"});
    DesktopStandIn desktop;
    // A double click is a click and then the second press, as the platform delivers it.
    QTest::mouseClick(table->viewport(), Qt::LeftButton, {}, rect(1).center());
    QTest::mouseDClick(table->viewport(), Qt::LeftButton, {}, rect(1).center());
    EXPECT_EQ(desktop.opened, QList<QUrl>{QUrl::fromLocalFile("/b c")});
    QTest::mouseClick(table->viewport(), Qt::LeftButton, Qt::ControlModifier, rect(2).center());
    auto* remove = child<QPushButton>("deleteButton", &window->attachmentsWindow());
    QTest::mouseClick(remove, Qt::LeftButton);
    EXPECT_EQ(shown(), "/a");
    table->clearSelection();
    QTest::mouseClick(remove, Qt::LeftButton);
    EXPECT_EQ(shown(), "");
}

} // namespace
