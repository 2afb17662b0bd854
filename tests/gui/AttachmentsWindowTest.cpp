#include "gui/AttachmentsWindow.h"
#include "DesktopStandIn.h"
#include "GuiFixture.h"
#include "attachments/AttachmentsController.h"
#include "gui/AttachmentsModel.h"

#include <QAction>
#include <QDir>
#include <QDropEvent>
#include <QFile>
#include <QMimeData>
#include <QPushButton>
#include <QTableView>
#include <QUrl>

#include <memory>

namespace {

// The attachments window with real drags dropped on its table: the view's own drag events
// carrying real QMimeData, file URLs as a file manager sends them or the table's private row
// type as the table itself puts it on a drag.
class AttachmentsTable : public GuiFixture {
protected:
    void SetUp() override {
        GuiFixture::SetUp();
        ASSERT_TRUE(files.isValid());
        ASSERT_TRUE(QDir(files.path()).mkdir(QStringLiteral("folder")));
        child<QAction>("attachmentsAction")->trigger();
        ASSERT_TRUE(QTest::qWaitForWindowExposed(&window->attachmentsWindow()));
        table = child<QTableView>("attachmentsTable", &window->attachmentsWindow());
    }

    QString file(const char* name) {
        const QString path = files.filePath(QLatin1String(name));
        QFile made(path);
        EXPECT_TRUE(made.open(QIODevice::WriteOnly));
        return path;
    }

    QString folder() const { return files.filePath(QStringLiteral("folder")); }

    static std::unique_ptr<QMimeData> fileDrag(const QStringList& paths) {
        auto data = std::make_unique<QMimeData>();
        QList<QUrl> urls;
        for (const QString& path : paths)
            urls << QUrl::fromLocalFile(path);
        data->setUrls(urls);
        return data;
    }

    std::unique_ptr<QMimeData> rowDrag(const QList<int>& rows) const {
        QModelIndexList indexes;
        for (const int row : rows)
            indexes << model().index(row, 0);
        return std::unique_ptr<QMimeData>(model().mimeData(indexes));
    }

    AttachmentsModel& model() const { return window->attachmentsWindow().model(); }

    // Where a drag lands at insertion row: the top edge of that row, or below the last.
    QPoint insertionPoint(int row) const {
        if (row < model().rowCount()) {
            const QRect rect = table->visualRect(model().index(row, 0));
            return {rect.center().x(), rect.top() + 1};
        }
        return {table->viewport()->width() / 2, table->viewport()->height() - 2};
    }

    // Drags data over the table and drops it at point; answers whether the hover was accepted.
    bool drop(const QMimeData& data, QPoint point, Qt::DropAction action = Qt::CopyAction) {
        QWidget* viewport = table->viewport();
        QDragEnterEvent enter(point, action, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &enter);
        QDragMoveEvent move(point, action, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &move);
        if (!move.isAccepted()) {
            QDragLeaveEvent leave;
            QCoreApplication::sendEvent(viewport, &leave);
            return false;
        }
        QDropEvent dropped(point, action, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &dropped);
        return true;
    }

    // Puts paths in the list one by one at the end, so that it holds them in that order.
    void fill(const QStringList& paths) {
        for (const QString& path : paths)
            ASSERT_TRUE(drop(*fileDrag({path}), insertionPoint(model().rowCount())));
        ASSERT_EQ(list(), paths);
    }

    QStringList list() const { return window->attachments().getAttachments(); }

    QStringList shown() const {
        QStringList rows;
        for (int row = 0; row < model().rowCount(); ++row)
            rows << model().index(row, 0).data().toString();
        return rows;
    }

    QTemporaryDir files;
    QTableView* table = nullptr;
};

TEST_F(AttachmentsTable, FilesLandInReverseOrderAtTheDropPoint) {
    const QString x = file("x.txt"), y = file("y.txt");
    fill({x, y});
    const QString a = file("a.txt"), b = file("b.txt"), c = file("c.txt");
    ASSERT_TRUE(drop(*fileDrag({a, b, c}), insertionPoint(1)));
    EXPECT_EQ(list(), (QStringList{x, c, b, a, y}));
    EXPECT_EQ(shown(), list());
    // What every message will carry: the controller's own list.
    EXPECT_EQ(controller().getAttachments().getAttachments(), (QStringList{x, c, b, a, y}));
}

TEST_F(AttachmentsTable, AFolderFirstIsRefusedAsAWhole) {
    const QString a = file("a.txt");
    EXPECT_FALSE(drop(*fileDrag({folder(), a}), insertionPoint(0)));
    EXPECT_TRUE(list().isEmpty());
}

TEST_F(AttachmentsTable, AFolderSecondIsTakenWithTheRest) {
    const QString a = file("a.txt");
    ASSERT_TRUE(drop(*fileDrag({a, folder()}), insertionPoint(0)));
    EXPECT_EQ(list(), (QStringList{folder(), a}));
}

TEST_F(AttachmentsTable, ADropOntoARowIsRefused) {
    const QString x = file("x.txt");
    fill({x});
    const std::unique_ptr<QMimeData> data = fileDrag({file("a.txt")});
    EXPECT_FALSE(model().canDropMimeData(data.get(), Qt::CopyAction, -1, -1, model().index(0, 0)));
    EXPECT_FALSE(model().dropMimeData(data.get(), Qt::CopyAction, -1, -1, model().index(0, 0)));
    EXPECT_TRUE(model().canDropMimeData(data.get(), Qt::CopyAction, 0, 0, QModelIndex()));
    EXPECT_EQ(list(), QStringList{x});
}

TEST_F(AttachmentsTable, ADragOfNeitherFilesNorRowsIsRefused) {
    QMimeData web;
    web.setUrls({QUrl(QStringLiteral("https://example.org/a.pdf"))});
    web.setText(QStringLiteral("a.pdf"));
    EXPECT_FALSE(drop(web, insertionPoint(0)));
    EXPECT_TRUE(list().isEmpty());
}

TEST_F(AttachmentsTable, RowsDragCarryThePrivateType) {
    fill({file("a.txt"), file("b.txt")});
    const std::unique_ptr<QMimeData> data = rowDrag({1});
    EXPECT_TRUE(data->hasFormat(QStringLiteral("MyPrivateTableViewDataType")));
    EXPECT_FALSE(data->hasUrls());
    EXPECT_EQ(model().mimeTypes().constFirst(), QStringLiteral("MyPrivateTableViewDataType"));
}

TEST_F(AttachmentsTable, ARowDraggedDownLandsAboveTheDropPoint) {
    const QString a = file("a.txt"), b = file("b.txt"), c = file("c.txt");
    fill({a, b, c});
    ASSERT_TRUE(drop(*rowDrag({0}), insertionPoint(3), Qt::MoveAction));
    EXPECT_EQ(list(), (QStringList{b, c, a}));
    ASSERT_TRUE(drop(*rowDrag({2}), insertionPoint(0), Qt::MoveAction));
    EXPECT_EQ(list(), (QStringList{a, b, c}));
}

TEST_F(AttachmentsTable, OfSeveralDraggedRowsOnlyTheFirstMoves) {
    const QString a = file("a.txt"), b = file("b.txt"), c = file("c.txt"), d = file("d.txt");
    fill({a, b, c, d});
    ASSERT_TRUE(drop(*rowDrag({3, 1}), insertionPoint(0), Qt::MoveAction));
    EXPECT_EQ(list(), (QStringList{b, a, c, d}));
}

TEST_F(AttachmentsTable, RemoveTakesTheSelectedRowsOrAll) {
    const QString a = file("a.txt"), b = file("b.txt"), c = file("c.txt");
    fill({a, b, c});
    table->selectionModel()->select(model().index(0, 0),
                                    QItemSelectionModel::Select | QItemSelectionModel::Rows);
    table->selectionModel()->select(model().index(2, 0),
                                    QItemSelectionModel::Select | QItemSelectionModel::Rows);
    auto* remove = child<QPushButton>("deleteButton", &window->attachmentsWindow());
    QTest::mouseClick(remove, Qt::LeftButton);
    EXPECT_EQ(list(), QStringList{b});
    table->clearSelection();
    QTest::mouseClick(remove, Qt::LeftButton);
    EXPECT_TRUE(list().isEmpty());
    EXPECT_TRUE(controller().getAttachments().getAttachments().isEmpty());
}

TEST_F(AttachmentsTable, DoubleClickOpensTheFileOnTheDesktop) {
    const QString a = file("a.txt"), b = file("b.txt");
    fill({a, b});
    DesktopStandIn desktop;
    const QPoint row1 = table->visualRect(model().index(1, 0)).center();
    // A double click is a click and then the second press, as the platform delivers it.
    QTest::mouseClick(table->viewport(), Qt::LeftButton, Qt::NoModifier, row1);
    QTest::mouseDClick(table->viewport(), Qt::LeftButton, Qt::NoModifier, row1);
    EXPECT_EQ(desktop.opened, QList<QUrl>{QUrl::fromLocalFile(b)});
}

} // namespace
