#include "gui/AttachmentsWindow.h"
#include "DesktopStandIn.h"
#include "GuiFixture.h"
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

// The rows of tests/data/gui/drops.txt, dropped by the view's own events.
std::vector<std::string> drops() {
    QFile file(QStringLiteral(PELMO_TEST_DATA "/gui/drops.txt"));
    EXPECT_TRUE(file.open(QIODevice::ReadOnly));
    std::vector<std::string> rows;
    for (const QByteArray& line : file.readAll().split('\n'))
        if (!line.startsWith('#') && line.count(" | ") == 5)
            rows.push_back(line.toStdString());
    return rows;
}

class Drops : public AttachmentsTable, public ::testing::WithParamInterface<std::string> {};

TEST_P(Drops, Land) {
    const QStringList field = QString::fromStdString(GetParam()).split(" | ");
    QList<int> rows;
    for (const QString& row : field[1].split(' ', Qt::SkipEmptyParts))
        if (row != "junk")
            rows += row.toInt();
    auto data =
        rows.isEmpty() ? std::make_unique<QMimeData>() : AttachmentsController::rowDragData(rows);
    if (field[1] == "junk")
        data->setData(AttachmentsController::privateDragType, "not an index set");
    data->setUrls(QUrl::fromStringList(field[2].split(' ', Qt::SkipEmptyParts)));
    const Qt::DropAction action = data->hasUrls() ? Qt::CopyAction : Qt::MoveAction;
    const QRect target = rect(field[3].toInt());
    const QPoint at = target.isValid() ? target.topLeft() + QPoint(5, 1)
                                       : QPoint(5, table->viewport()->height() - 2);
    QDragEnterEvent enter(at, action, data.get(), Qt::LeftButton, {});
    QDropEvent dropped(at, action, data.get(), Qt::LeftButton, {});
    QSignalSpy changes(&window->attachments(), &AttachmentsController::attachmentsChanged);
    QCoreApplication::sendEvent(table->viewport(), &enter);
    QCoreApplication::sendEvent(table->viewport(), &dropped);
    EXPECT_EQ(enter.isAccepted() && dropped.isAccepted(), field[5] == "taken");
    // What the drag's cursor shows while it moves over the table.
    EXPECT_EQ(model().canDropMimeData(data.get(), action, -1, -1, {}), field[5] == "taken");
    EXPECT_EQ(shown() + " / " + QString::number(changes.size()),
              field[4] + (field[4] == "/a /b /c /d" ? " / 0" : " / 1"));
}

INSTANTIATE_TEST_SUITE_P(Rows, Drops, ::testing::ValuesIn(drops()),
                         [](const auto& row) { return row.param.substr(0, row.param.find(' ')); });

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
