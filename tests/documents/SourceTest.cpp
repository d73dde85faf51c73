#include "platform/documents/preview/SourceIndex.h"
#include "platform/documents/preview/SyntaxColors.h"
#include "platform/documents/preview/TextWidget.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/Theme.h"
#include "tests/documents/PreviewFixture.h"

#include <QtTest/QTest>

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <string>
#include <vector>

using namespace platform;

namespace {

const SyntaxLanguage* languageOf(const std::string& name) {
    return syntaxLanguageFor(TypeRegistry::identifierForFileName(name));
}

/// The line with a letter under each unit: c(omment) s(tring) k(eyword) n(umber) N(ame)
/// d(irective), or a dot.
std::string colors(const SyntaxLanguage& language, const std::string& line, SyntaxState& state) {
    std::string out(line.size(), '.');
    for (const SyntaxSpan& span : scanSyntax(language, QString::fromStdString(line), state))
        for (int i = span.start; i < span.start + span.length; ++i)
            out[static_cast<std::size_t>(i)] = "csknNd"[static_cast<int>(span.kind)];
    return out;
}

std::string colorsIn(const std::string& file, const std::string& line) {
    SyntaxState state = 0;
    return colors(*languageOf(file), line, state);
}

TEST(Syntax, coloursWhatMattersInEveryFamilyOfLanguages) {
    EXPECT_EQ(colorsIn("a.cpp", "int x = 0x1F; // no"), "kkk.....nnnn..ccccc");
    EXPECT_EQ(colorsIn("a.cpp", "#include <x>"), "ddddddddd...");
    EXPECT_EQ(colorsIn("a.cpp", R"(f("a\"b", 'c'))"), R"(..ssssss..sss.)");
    EXPECT_EQ(colorsIn("a.py", "def f(): # def"), "kkk......ccccc");
    EXPECT_EQ(colorsIn("a.sh", "echo $HOME a#b"), "kkkk.NNNNN....");
    EXPECT_EQ(colorsIn("a.json", R"({"a": "b", "c": true})"), ".NNN..sss..NNN..kkkk.");
    EXPECT_EQ(colorsIn("a.yaml", "u: http://x #c"), "N...........cc");
    EXPECT_EQ(colorsIn("a.sql", "select 'it''s' -- x"), "kkkkkk.sssssss.cccc");
    EXPECT_EQ(colorsIn("a.xml", "<a b='c'>d&lt;</a>"), "kk.N.sssk.nnnnkkkk");
    EXPECT_EQ(colorsIn("a.patch", "+new"), "ssss");
    EXPECT_EQ(colorsIn("a.toml", "[a]"), "ddd");
}

TEST(Syntax, whatOneLineOpensGoesOnInTheNext) {
    SyntaxState state = 0;
    const SyntaxLanguage& cpp = *languageOf("a.cpp");
    EXPECT_EQ(colors(cpp, "a /* b", state), "..cccc");
    EXPECT_EQ(colors(cpp, "#int", state), "cccc");
    EXPECT_EQ(colors(cpp, "c */ if", state), "cccc.kk");
    const SyntaxLanguage& python = *languageOf("a.py");
    EXPECT_EQ(colors(python, "x = '''if", state), "....sssss");
    EXPECT_EQ(colors(python, "\"\"\" \\'''", state), "ssssssss");
    EXPECT_EQ(colors(python, "''' if", state), "sss.kk");
    const SyntaxLanguage& xml = *languageOf("a.xml");
    EXPECT_EQ(colors(xml, "<a b=\"c", state), "kk.N.ss");
    EXPECT_EQ(colors(xml, "d\" e>", state), "ss.Nk");
}

TEST(Syntax, everyPrefixOfGarbageIsScannedToItsEnd) {
    const std::string garbage = "\"'`/**/\\#$${<!--<?&;]]>\"\"\"'''\\\\=begin[[--]]@+-diff 0x..";
    for (const char* const name : {"a.cpp", "a.py", "a.sh", "a.xml", "a.json", "a.patch", "a.ini",
                                   "a.rb", "a.lua", "a.unheard"}) {
        const SyntaxLanguage* const language = languageOf(name);
        if (!language)
            continue;
        for (std::size_t start = 0; start < garbage.size(); ++start) {
            SyntaxState state = 0;
            for (int round = 0; round < 3; ++round)
                EXPECT_EQ(colors(*language, garbage.substr(start), state).size(),
                          garbage.size() - start);
        }
    }
}

double luminance(const Color& color) {
    const auto linear = [](double part) {
        return part <= 0.03928 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(color.red) + 0.7152 * linear(color.green) + 0.0722 * linear(color.blue);
}

TEST(Syntax, coloursCanBeReadOnLightAndOnDark) {
    for (const Color& ground : {Theme::page, Theme::text})
        for (int kind = 0; kind < 6; ++kind) {
            const double a = luminance(syntaxColor(static_cast<SyntaxKind>(kind), ground)) + 0.05;
            const double b = luminance(ground) + 0.05;
            EXPECT_GE(std::max(a, b) / std::min(a, b), 4.5) << kind;
        }
}

struct Sources : test::Preview {
    static std::string program(int functions) {
        std::string text = "/* from here\n";
        for (int i = 0; i < functions; ++i)
            text += i % 50 == 49 ? "*/ int f" + std::to_string(i) + "(); /*\n" : "some words\n";
        return text;
    }
};

TEST_F(Sources, numbersAndColoursAreTheSameFromWhereverOneComes) {
    const std::string path = house.givenFile("Long.cpp", program(60'000));
    const TextFile file = std::move(TextFile::open(Url::file(path), path)).value();
    SourceIndex forward(file, *languageOf("Long.cpp"));
    std::vector<TextLine> all;
    for (std::uint64_t at = 0; at < file.size(); at = all.back().end) {
        std::vector<TextLine> lines = file.linesFrom(at);
        forward.describe(lines);
        all.insert(all.end(), lines.begin(), lines.end());
    }
    ASSERT_EQ(all.back().number, 60'001U);
    SourceIndex sudden(file, *languageOf("Long.cpp"));
    for (const std::uint64_t place : {file.size(), file.size() / 2, std::uint64_t{5}}) {
        std::vector<TextLine> lines = file.linesAround(place);
        sudden.describe(lines);
        for (const TextLine& line : lines) {
            const TextLine& known = all[static_cast<std::size_t>(line.number - 1)];
            ASSERT_EQ(known.offset, line.offset);
            ASSERT_EQ(known.spans, line.spans);
        }
    }
}

TEST_F(Sources, aLineInPiecesHasOneNumber) {
    const std::string path = house.givenFile("Min.js", "a\n" + std::string(400'000, 'x') + "\nb\n");
    const TextFile file = std::move(TextFile::open(Url::file(path), path)).value();
    SourceIndex index(file, *languageOf("Min.js"));
    std::vector<TextLine> last = file.linesAround(file.size());
    index.describe(last);
    EXPECT_EQ(last.back().number, 3U);
    std::vector<TextLine> pieces = file.linesAround(file.size() / 2);
    index.describe(pieces);
    EXPECT_EQ(pieces.back().number, 0U);
}

TEST_F(Sources, aProgramIsShownNumberedAndInColourAndFromLeftToRight) {
    house.givenFile("Long.cpp", program(20'000));
    for (const bool rightToLeft : {false, true}) {
        house.application->setRightToLeft(rightToLeft);
        screen->seen.clear();
        show("Long.cpp");
        ASSERT_TRUE(untilShown());
        auto* const text = find<TextWidget>();
        EXPECT_NE(colorAt(*text, 0.01, 0.9), QColor(Qt::white)) << "the strip of the numbers";
        QTest::keyClick(text, Qt::Key_End);
        EXPECT_TRUE(house.until([&] { return text->topOffset() > 200'000; }));
    }
    for (const char* const name : {"a.cpp", "a.jsx", "a.toml", "a.swift", "Makefile", "a.xml"})
        EXPECT_TRUE(PlatformPreviewController::canPreview(Url::file(std::string("/none/") + name)))
            << name;
}

} // namespace
