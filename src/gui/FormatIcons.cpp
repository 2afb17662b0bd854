#include "gui/FormatIcons.h"

#include <QApplication>
#include <QColor>
#include <QFont>
#include <QPainter>
#include <QPalette>
#include <QPixmap>

#include <functional>

namespace {

constexpr int kSize = 16;
constexpr qreal kScale = 2.0; // sharp on high-density screens too

QIcon drawn(const std::function<void(QPainter&, const QColor&)>& paint) {
    QPixmap pixmap(kSize * kScale, kSize * kScale);
    pixmap.setDevicePixelRatio(kScale);
    pixmap.fill(Qt::transparent);
    QPainter painter(&pixmap);
    painter.setRenderHint(QPainter::Antialiasing);
    paint(painter, QApplication::palette().color(QPalette::WindowText));
    return QIcon(pixmap);
}

QIcon themed(const char* themeName, const std::function<QIcon()>& fallback) {
    const QString name = QLatin1String(themeName);
    return QIcon::hasThemeIcon(name) ? QIcon::fromTheme(name) : fallback();
}

void line(QPainter& painter, const QColor& color, qreal left, qreal right, qreal y) {
    painter.fillRect(QRectF(left, y, right - left, 1.5), color);
}

} // namespace

QIcon letterIcon(const char* themeName, const QString& letter, const QFont& font) {
    return themed(themeName, [&] {
        return drawn([&](QPainter& painter, const QColor& color) {
            QFont sized = font;
            sized.setPixelSize(13);
            painter.setFont(sized);
            painter.setPen(color);
            painter.drawText(QRectF(0, 0, kSize, kSize), Qt::AlignCenter, letter);
        });
    });
}

QIcon alignmentIcon(const char* themeName, Qt::Alignment alignment) {
    return themed(themeName, [alignment] {
        return drawn([alignment](QPainter& painter, const QColor& color) {
            const qreal widths[] = {13, 9, 13, 7};
            for (int i = 0; i < 4; ++i) {
                const qreal width = alignment & Qt::AlignJustify ? 13 : widths[i];
                qreal left = 1.5;
                if (alignment & Qt::AlignHCenter)
                    left = (kSize - width) / 2;
                else if (alignment & Qt::AlignRight)
                    left = kSize - 1.5 - width;
                line(painter, color, left, left + width, 3 + i * 3.2);
            }
        });
    });
}

QIcon bulletListIcon(const char* themeName) {
    return themed(themeName, [] {
        return drawn([](QPainter& painter, const QColor& color) {
            painter.setPen(Qt::NoPen);
            painter.setBrush(color);
            for (int i = 0; i < 3; ++i) {
                const qreal y = 3.5 + i * 4.5;
                painter.drawEllipse(QPointF(2.5, y), 1.5, 1.5);
                line(painter, color, 6, 15, y - 0.75);
            }
        });
    });
}

QIcon textColorIcon(const QColor& color) {
    return drawn([color](QPainter& painter, const QColor& text) {
        QFont font = QApplication::font();
        font.setPixelSize(11);
        font.setBold(true);
        painter.setFont(font);
        painter.setPen(text);
        painter.drawText(QRectF(0, 0, kSize, 12), Qt::AlignCenter, QStringLiteral("A"));
        painter.fillRect(QRectF(2, 12.5, 12, 3), color);
    });
}
