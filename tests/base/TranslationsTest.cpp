// Keeps the translation files whole: what the sources ask for is there, and nothing else.

#include "platform/base/ByteCount.h"
#include "platform/base/DateFormat.h"
#include "platform/base/Text.h"
#include "tests/base/SourceKeys.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <regex>

using platform::ByteCountStyle;
using platform::byteCountText;
using platform::localized;
using platform::localizedPlural;
using test::Translations;
using testing::ElementsAre;
using testing::IsEmpty;

namespace {

const test::SourceKeys& sources() {
    static const test::SourceKeys keys = test::readSourceKeys(TAVRIN_SOURCE_DIR);
    return keys;
}

Translations tableOf(const std::string& language) {
    return test::readTranslations(TAVRIN_SOURCE_DIR "/resources/i18n/tavrin_" + language + ".ts");
}

bool isPlural(const std::string& key) {
    return key.starts_with(".DICT.");
}

/// The positions that a text fills: of "%@, %@" as of "%2$@, %1$@" they are 1 and 2.
std::multiset<std::string> placeholders(const std::string& text) {
    static const std::regex pattern("%(?:(\\d)\\$)?@|%n");
    std::multiset<std::string> found;
    int next = 0;
    for (std::sregex_iterator at(text.begin(), text.end(), pattern), end; at != end; ++at) {
        if (at->str() == "%n")
            found.insert("%n");
        else
            found.insert((*at)[1].matched ? (*at)[1].str() : std::to_string(++next));
    }
    return found;
}

std::multiset<std::string> wantedPlaceholders(const std::string& key) {
    if (key.ends_with(".%d"))
        return {"%n"};
    return key.ends_with(".%g") ? std::multiset<std::string>{"1"} : placeholders(key);
}

/// Arabic has words for none, one and two, so its first three forms may leave the figure out.
bool mayBeInWords(const std::vector<std::string>& forms, std::size_t form) {
    return forms.size() == 6 && form < 3;
}

class InLanguage : public testing::TestWithParam<const char*> {
protected:
    void SetUp() override { ASSERT_EQ(platform::loadLocalizedTexts(GetParam()), GetParam()); }
    void TearDown() override { platform::loadLocalizedTexts("en_US"); }

    const Translations table = tableOf(GetParam());
};

TEST(SourceKeys, ReachTheTableAsLiteralsOrByAKnownWay) {
    EXPECT_THAT(sources().lost, IsEmpty());
    EXPECT_THAT(sources().indirect,
                ElementsAre("platform/base/ByteCount.cpp", "platform/base/Error.cpp",
                            "platform/launch/DocumentInteractionController.cpp",
                            "platform/launch/TypeRegistry.cpp", "preview/FileInfoStackView.cpp"));
}

TEST(English, HasThePluralsOfTheSourcesAndNothingElse) {
    std::vector<std::string> asked;
    for (const auto& [key, file] : sources().files)
        if (isPlural(key))
            asked.push_back(key);
    std::vector<std::string> there;
    for (const auto& [key, forms] : tableOf("en"))
        there.push_back(key);
    EXPECT_EQ(there, asked);
}

TEST_P(InLanguage, EveryTextOfTheSourcesHasATranslation) {
    for (const auto& [key, file] : sources().files)
        EXPECT_TRUE(table.contains(key)) << file << ": " << key;
}

TEST_P(InLanguage, EveryTranslationIsOfATextOfTheSources) {
    for (const auto& [key, forms] : table)
        EXPECT_TRUE(sources().files.contains(key)) << key;
}

TEST_P(InLanguage, TranslationsFillWhatTheTextsFill) {
    for (const auto& [key, forms] : table)
        for (std::size_t form = 0; form < forms.size(); ++form)
            EXPECT_TRUE(placeholders(forms[form]) == wantedPlaceholders(key) ||
                        (isPlural(key) && mayBeInWords(forms, form)))
                << key << " → " << forms[form];
}

TEST_P(InLanguage, TranslationsAreSetLikePrintedText) {
    for (const auto& [key, forms] : table)
        for (const std::string& form : forms)
            EXPECT_FALSE(form.empty() || form.find_first_of("\"<>\t\n") != std::string::npos ||
                         form.find("...") != std::string::npos || form.find("  ") < form.size())
                << key << " → " << form;
}

TEST_P(InLanguage, TheProgramShowsWhatTheFileSays) {
    for (const auto& [key, forms] : table) {
        if (!isPlural(key)) {
            EXPECT_EQ(localized(key), forms.front());
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Translations, InLanguage, testing::Values("de", "ru", "ar"),
                         [](const auto& one) { return std::string(one.param); });

/// What a language makes of counts, in the order of `counts`.
class Counting : public testing::Test {
protected:
    static std::vector<std::string> items(const std::string& language) {
        platform::loadLocalizedTexts(language);
        std::vector<std::string> texts;
        for (const int count : {0, 1, 2, 5, 11, 21, 100})
            texts.push_back(localizedPlural(".DICT.ITEMS.%d", count));
        return texts;
    }
    static std::vector<std::string> sizes(const std::string& language) {
        platform::loadLocalizedTexts(language);
        std::vector<std::string> texts;
        for (const std::uint64_t bytes : {0ULL, 1ULL, 2ULL, 21ULL, 6'291'456ULL, 1'500'000'000ULL})
            texts.push_back(byteCountText(bytes, ByteCountStyle::file));
        return texts;
    }
    void TearDown() override { platform::loadLocalizedTexts("en_US"); }
};

TEST_F(Counting, InGerman) {
    EXPECT_THAT(items("de_DE"), ElementsAre("0 Objekte", "1 Objekt", "2 Objekte", "5 Objekte",
                                            "11 Objekte", "21 Objekte", "100 Objekte"));
    EXPECT_THAT(sizes("de_DE"),
                ElementsAre("0 Byte", "1 Byte", "2 Byte", "21 Byte", "6,3\u00a0MB", "1,5\u00a0GB"));
    EXPECT_EQ(localizedPlural(".DICT.ITEMS.%d", 12'345), "12.345 Objekte");
}

TEST_F(Counting, InRussian) {
    EXPECT_THAT(items("ru_RU"), ElementsAre("0 объектов", "1 объект", "2 объекта", "5 объектов",
                                            "11 объектов", "21 объект", "100 объектов"));
    EXPECT_THAT(sizes("ru_RU"), ElementsAre("0 байт", "1 байт", "2 байта", "21 байт", "6,3\u00a0МБ",
                                            "1,5\u00a0ГБ"));
}

TEST_F(Counting, InArabic) {
    EXPECT_THAT(items("ar"), ElementsAre("لا عناصر", "عنصر واحد", "عنصران", "٥ عناصر", "١١ عنصرًا",
                                         "٢١ عنصرًا", "١٠٠ عنصر"));
    EXPECT_THAT(sizes("ar"), ElementsAre("٠ بايت", "بايت واحد", "بايتان", "٢١ بايتًا",
                                         "٦٫٣\u00a0ميغابايت", "١٫٥\u00a0غيغابايت"));
}

TEST_F(Counting, WritesEveryFigureOfASentenceInTheSameFigures) {
    const platform::Date date = platform::Date::fromSeconds(1'406'821'384);
    for (const char* language : {"ar", "ar_EG"}) {
        platform::loadLocalizedTexts(language);
        EXPECT_EQ(platform::localizedFormat("%1$@ of %2$@", 3, std::size_t{12}), "٣ من ١٢");
        EXPECT_EQ(platform::localizedDateText(date, platform::DateStyle::longStyle)
                      .find_first_of("0123456789,"),
                  std::string::npos);
    }
    platform::loadLocalizedTexts("ar_MA"); // counts in the figures of the West
    EXPECT_EQ(localizedPlural(".DICT.ITEMS.%d", 5), "5 عناصر");
    EXPECT_EQ(platform::localizedFormat("%1$@ of %2$@", 3, 12), "3 من 12");
}

} // namespace
