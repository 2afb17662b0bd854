#pragma once

#include <QFile>
#include <QRegularExpression>
#include <gtest/gtest.h>

// The files of tests/data/smtp are sections, each opened by a line "== name".

inline QString smtpData(const QString& name) {
    QFile file(QStringLiteral(PELMO_TEST_DATA "/smtp/") + name);
    EXPECT_TRUE(file.open(QIODevice::ReadOnly)) << name.toStdString();
    return QString::fromUtf8(file.readAll());
}

inline QString sectionOf(const QString& text, const std::string& name) {
    return text.section(QString::fromStdString("\n== " + name + '\n'), 1).section("\n== ", 0, 0);
}

inline std::vector<std::string> sectionNames(const QString& text) {
    std::vector<std::string> names;
    for (const auto& match :
         QRegularExpression("^== (\\w+)$", QRegularExpression::MultilineOption).globalMatch(text))
        names.push_back(match.captured(1).toStdString());
    return names;
}

// "\r", "\n", "\0" and "\xHH" stand for those bytes, "\" followed by anything else for that.
inline QByteArray unescape(const QByteArray& text) {
    QByteArray out;
    for (qsizetype i = 0; i < text.size(); ++i) {
        if (text[i] != '\\' || i + 1 == text.size())
            out += text[i];
        else if (const char c = text[++i]; c == 'x')
            out += static_cast<char>(text.mid(i + 1, 2).toInt(nullptr, 16)), i += 2;
        else
            out += c == 'r' ? '\r' : c == 'n' ? '\n' : c == '0' ? '\0' : c;
    }
    return out;
}
