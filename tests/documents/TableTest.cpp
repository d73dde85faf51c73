#include "platform/documents/preview/TableContent.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "tests/documents/PreviewFixture.h"

#include <QLabel>
#include <QtTest/QTest>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace platform;
using ::testing::ElementsAre;
using Texts = std::vector<std::string>;

namespace {

struct Tables : ::testing::Test {
    test::TemporaryFolder folder;
    TableFile open(const std::string& content) {
        const std::string path = folder.write("t.csv", content);
        TableFile table = std::move(TableFile::open(Url::file(path), path)).value();
        while (!table.isCounted())
            table.countMore();
        return table;
    }
    static Texts texts(const TableRow& row) {
        Texts out;
        for (const QString& cell : row)
            out.push_back(cell.toStdString());
        return out;
    }
    /// All rows of a small table.
    std::vector<Texts> rows(const std::string& content) {
        std::vector<Texts> out;
        for (const TableRow& row : open(content).rows(0, 1000))
            out.push_back(texts(row));
        return out;
    }
};

TEST_F(Tables, findWhatSeparatesTheirCells) {
    EXPECT_THAT(rows("a,b\n1,2\n"), ElementsAre(Texts{"a", "b"}, Texts{"1", "2"}));
    EXPECT_THAT(rows("a;b\n1,5;2,5"), ElementsAre(Texts{"a", "b"}, Texts{"1,5", "2,5"}));
    EXPECT_THAT(rows("a\tb, c\n1\t2"), ElementsAre(Texts{"a", "b, c"}, Texts{"1", "2"}));
    EXPECT_THAT(rows("a|b\n1|2"), ElementsAre(Texts{"a", "b"}, Texts{"1", "2"}));
    EXPECT_THAT(rows("sep=;\r\na,b;c\r\n"), ElementsAre(Texts{"a,b", "c"}));
    EXPECT_THAT(rows("one\ntwo\n"), ElementsAre(Texts{"one"}, Texts{"two"}));
}

TEST_F(Tables, quotesHoldWhatWouldEndACell) {
    EXPECT_THAT(rows("\"a,b\",\"c\nd\",\"e\"\"f\"\"\"\n1,2,3"),
                ElementsAre(Texts{"a,b", "c↵d", "e\"f\""}, Texts{"1", "2", "3"}));
    EXPECT_THAT(rows("5\" wide,a\"\"b\n1,2"),
                ElementsAre(Texts{"5\" wide", "a\"\"b"}, Texts{"1", "2"}))
        << "within a cell a quote is a quote";
    EXPECT_THAT(rows("a,,c,\n\n\"\",x"),
                ElementsAre(Texts{"a", "", "c", ""}, Texts{""}, Texts{"", "x"}))
        << "rows of any length";
}

TEST_F(Tables, areReadInEveryEncoding) {
    const std::vector<Texts> wanted{{"Größe", "b"}, {"ä\"ö", "x↵y"}};
    const QString text = QStringLiteral("Größe;b\r\n\"ä\"\"ö\";\"x\r\ny\"\r\n");
    EXPECT_EQ(rows(text.toStdString()), wanted);
    EXPECT_EQ(rows("\xEF\xBB\xBF" + text.toStdString()), wanted);
    EXPECT_EQ(rows(text.toLatin1().toStdString()), wanted);
    std::string little("\xFF\xFE");
    std::string big("\xFE\xFF");
    for (const QChar unit : text) {
        const char low = static_cast<char>(unit.unicode());
        little += {low, '\0'};
        big += {'\0', low};
    }
    EXPECT_EQ(rows(little), wanted);
    EXPECT_EQ(rows(big), wanted);
}

TEST_F(Tables, ofAnyLengthAreCountedAndReadAnywhere) {
    std::string text = "id,text\n";
    for (int i = 1; i < 400'000; ++i)
        text += std::to_string(i) + (i % 3 ? ",plain\n" : ",\"a\nb\"\n");
    const TableFile table = open(text);
    ASSERT_EQ(table.rowCount(), 400'000U);
    for (const std::uint64_t first : {0U, 255U, 256U, 199'999U, 399'990U}) {
        const std::vector<TableRow> found = table.rows(first, 20);
        EXPECT_EQ(found.size(), std::min<std::size_t>(20, 400'000 - first));
        for (std::size_t i = first ? 0 : 1; i < found.size(); ++i)
            ASSERT_EQ(found[i][0].toULongLong(), first + i);
    }
    EXPECT_TRUE(table.rows(400'000, 5).empty());
}

TEST_F(Tables, whatNeverEndsIsBounded) {
    const std::string rest(3'000'000, 'x');
    const TableFile quoted = open("a,b\n\"open," + rest + "\nlast,row\n");
    EXPECT_LT(quoted.rowCount(), 30U);
    EXPECT_EQ(texts(quoted.rows(quoted.rowCount() - 1, 1)[0]), (Texts{"last", "row"}));
    const TableFile wide = open(std::string(2'000'000, ','));
    for (const TableRow& row : wide.rows(0, 20))
        EXPECT_LE(row.size(), TableFile::mostColumns + 1);
    EXPECT_LT(open("a,b\n" + rest + ",2\n").rows(1, 1)[0][0].size(), 5000);
    EXPECT_GT(open(std::string(100'000, '"')).rowCount(), 0U);
    EXPECT_GT(open(std::string(100'001, '\0')).rowCount(), 0U);
}

struct TablePreview : test::Preview {
    ZoomWidget* table() { return find<ZoomWidget>(); }
    TableContent& content() { return static_cast<TableContent&>(table()->content()); }
    static std::string longTable(int rows) {
        std::string text = "Number,Name,Comment\n";
        for (int i = 0; i < rows; ++i)
            text += std::to_string(i) + ",Name of " + std::to_string(i) + ",\"a, b, and then so on for a while\"\n";
        return text;
    }
    bool untilCounted(std::uint64_t rows) {
        return house.until([&] { return content().rowCount() == rows; });
    }
    /// Taps on the cell there, in points of the view, once it has been read.
    QString textAt(QPoint place) {
        QLabel* const label = table()->findChild<QLabel*>();
        EXPECT_TRUE(house.until([&] {
            table()->grab();
            const QPointF inContent = table()->visibleRect().topLeft() + QPointF(place);
            const auto cell = content().cellAt(inContent, table()->visibleRect());
            return cell && !content().textOf(*cell).isEmpty();
        }));
        QTest::mouseClick(table(), Qt::LeftButton, {}, place);
        return label->isVisible() ? label->text() : QString();
    }
};

TEST_F(TablePreview, aLongTableIsThereAtOnceAndToItsEnd) {
    house.givenFile("Long.csv", longTable(300'000));
    show("Long.csv");
    ASSERT_TRUE(untilShown());
    EXPECT_EQ(textAt({90, 50}), QStringLiteral("0"));
    ASSERT_TRUE(untilCounted(300'001));
    QTest::keyClick(table(), Qt::Key_End);
    const double top = table()->visibleRect().top();
    EXPECT_GT(top, 300'000 * 20.0);
    EXPECT_GT(textAt({90, 50}).toInt(), 299'900);
    house.givenFile("Long.csv", longTable(299'999));
    screen->refreshCurrentPreviewItem();
    ASSERT_TRUE(untilShown(2));
    ASSERT_TRUE(untilCounted(300'000));
    EXPECT_NEAR(table()->visibleRect().top(), top, 60) << "the place is kept";
}

TEST_F(TablePreview, namesAndNumbersOfRowsStayInView) {
    house.givenFile("Long.csv", longTable(1000));
    show("Long.csv");
    ASSERT_TRUE(untilShown());
    table()->grab();
    const QRect corner(0, 0, 200, 30);
    const QImage before = table()->grab(corner).toImage();
    QTest::keyClick(table(), Qt::Key_PageDown);
    EXPECT_EQ(table()->grab(corner).toImage(), before);
    EXPECT_NE(textAt({120, 60}), QStringLiteral("Name of 0"));
}

TEST_F(TablePreview, fromRightToLeftItBeginsAtTheRight) {
    house.application->setRightToLeft(true);
    house.givenFile("Long.csv", longTable(1000));
    show("Long.csv");
    ASSERT_TRUE(untilShown());
    const QRectF seen = table()->visibleRect();
    EXPECT_EQ(seen.right(), content().contentSize().width());
    EXPECT_EQ(textAt({table()->width() - 90, 50}), QStringLiteral("0"));
}

TEST_F(TablePreview, aTouchShowsTheWholeCellAndAnotherHidesIt) {
    const std::string comment = std::string(60, 'w') + " and its end";
    house.givenFile("Wide.tsv", "Name\tComment\nAnna\t" + comment + "\n");
    show("Wide.tsv");
    ASSERT_TRUE(untilShown());
    EXPECT_EQ(textAt({200, 50}).toStdString(), comment);
    EXPECT_EQ(textAt({200, 50}), QString());
}

} // namespace
