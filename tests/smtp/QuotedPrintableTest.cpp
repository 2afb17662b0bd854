#include "smtp/QuotedPrintable.h"

#include "RowName.h"

#include <gmime/gmime.h>
#include <gtest/gtest.h>

#include <QList>
#include <QRandomGenerator>

namespace {

// GMime's decoder, as a receiving reader would use it.
QByteArray decode(const QByteArray& encoded) {
    QByteArray out(encoded.size() + 4, '\0');
    int state = 0;
    guint32 save = 0;
    const size_t length = g_mime_encoding_quoted_decode_step(
        reinterpret_cast<const unsigned char*>(encoded.constData()),
        static_cast<size_t>(encoded.size()), reinterpret_cast<unsigned char*>(out.data()), &state,
        &save);
    out.truncate(static_cast<qsizetype>(length));
    return out;
}

struct Row {
    std::string name;
    QByteArray bytes;
    QByteArray encoded;

    // Names the row in test listings instead of a byte dump.
    friend void PrintTo(const Row& row, std::ostream* out) { *out << row.name; }
};

class QuotedPrintable : public ::testing::TestWithParam<Row> {};

TEST_P(QuotedPrintable, EncodesExactly) {
    EXPECT_EQ(EncodeQuotedPrintable(GetParam().bytes).toStdString(),
              GetParam().encoded.toStdString());
}

const QByteArray a72(72, 'a');
const QByteArray a74(74, 'a');
const QByteArray a75(75, 'a');

INSTANTIATE_TEST_SUITE_P(
    Rows, QuotedPrintable,
    ::testing::Values(Row{"empty", "", ""}, Row{"printable", "Hello, world!", "Hello, world!"},
                      Row{"equals_sign", "a=b", "a=3Db"},
                      Row{"line_break_bytes", "a\r\nb\nc\rd", "a=0D=0Ab=0Ac=0Dd"},
                      Row{"inner_space_and_tab", "a b\tc", "a b\tc"},
                      Row{"trailing_space", "a ", "a=20"}, Row{"trailing_tab", "a\t", "a=09"},
                      Row{"controls_and_high_bytes", QByteArray("\x00\x1b\x7f\x80\xff", 5),
                          "=00=1B=7F=80=FF"},
                      Row{"full_line_without_break", a75, a75},
                      Row{"soft_break_after_75", a75 + "b", a75 + "=\nb"},
                      Row{"escape_that_just_fits", a72 + "\xe9", a72 + "=E9"},
                      Row{"escape_moved_whole_to_the_next_line", a74 + "\xe9", a74 + "=\n=E9"}),
    RowName());

TEST(QuotedPrintableRoundTrip, EveryByteComesBackAndNoLineIsTooLong) {
    g_mime_init();
    QByteArray bytes;
    for (int round = 0; round < 3; ++round) {
        for (int value = 0; value < 256; ++value)
            bytes += static_cast<char>(value);
    }
    QRandomGenerator random(20240501);
    for (int i = 0; i < 5000; ++i)
        bytes += static_cast<char>(random.bounded(256));
    bytes += "ends with a space ";

    const QByteArray encoded = EncodeQuotedPrintable(bytes);
    EXPECT_EQ(decode(encoded), bytes);
    const QList<QByteArray> lines = encoded.split('\n');
    for (qsizetype i = 0; i < lines.size(); ++i) {
        EXPECT_LE(lines[i].size(), 76) << "line " << i;
        if (i + 1 < lines.size()) {
            EXPECT_TRUE(lines[i].endsWith('=')) << "line " << i << " is not a soft break";
        }
    }
    EXPECT_FALSE(encoded.contains('\r'));
}

} // namespace
