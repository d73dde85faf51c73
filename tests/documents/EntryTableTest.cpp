#include "platform/documents/model/EntryTable.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>

using namespace platform;

namespace {

DocumentEntry file(std::string name) {
    return {std::move(name), EntryKind::file, false, nullptr};
}
DocumentEntry folder(std::string name) {
    return {std::move(name), EntryKind::folder, false, nullptr};
}
EntryFact there(DocumentEntry entry) {
    return {std::move(entry), true};
}
EntryFact gone(std::string name) {
    return {file(std::move(name)), false};
}

std::vector<DocumentEntry> sorted(std::vector<DocumentEntry> entries) {
    CancelFlag never;
    sortEntries(entries, never);
    return entries;
}

std::vector<std::string> names(const EntryTable& table) {
    std::vector<std::string> all;
    for (std::size_t i = 0; i < table.size(); ++i)
        all.push_back(table.at(i).entry.name);
    return all;
}

using Names = std::vector<std::string>;

struct Table : ::testing::Test {
    EntryTable table;
    void given(std::vector<DocumentEntry> entries) { table.adopt(sorted(std::move(entries))); }
    RowId idOf(std::string_view name) const {
        const EntryTable::Row* const row = table.find(name);
        return row ? row->id : 0;
    }
};

TEST_F(Table, ordersNumbersByValueFoldersFirstAndCaseLast) {
    given({file("Report 10.pdf"), file("report 2.pdf"), file("Report 2.pdf"), folder("zoo"),
           file("apple"), file("Äpfel"), folder("Archive")});
    EXPECT_EQ(names(table), (Names{"Archive", "zoo", "Äpfel", "apple", "report 2.pdf",
                                   "Report 2.pdf", "Report 10.pdf"}));
}

TEST_F(Table, keepsARowThroughRenameReorderAndReread) {
    given({file("a"), file("b"), file("c")});
    const RowId row = idOf("a");
    EXPECT_TRUE(table.apply({{{"a", "z"}}, {gone("a"), there(file("z"))}}));
    EXPECT_EQ(names(table), (Names{"b", "c", "z"}));
    EXPECT_EQ(table.indexOf(row), 2U);
    given({file("a"), file("z")});
    EXPECT_EQ(idOf("z"), row);
    EXPECT_NE(idOf("a"), row);
}

TEST_F(Table, aSaveByRenameOverTheOldFileKeepsTheOldRow) {
    given({file("text.txt"), file("text.txt~tmp")});
    const RowId row = idOf("text.txt");
    table.apply({{{"text.txt~tmp", "text.txt"}}, {gone("text.txt~tmp"), there(file("text.txt"))}});
    EXPECT_EQ(names(table), (Names{"text.txt"}));
    EXPECT_EQ(idOf("text.txt"), row);
}

TEST_F(Table, aFolderInPlaceOfAFileIsAnotherRow) {
    given({file("x"), file("y")});
    const RowId row = idOf("y");
    table.apply({{}, {there(folder("y"))}});
    EXPECT_EQ(names(table), (Names{"y", "x"}));
    EXPECT_EQ(table.find(row), nullptr);
}

TEST_F(Table, detailsReadBeforeAChangeAreKnownToBeOld) {
    given({file("x")});
    const EntryTable::Row row = table.at(0);
    table.apply({{}, {there(file("x"))}});
    EXPECT_FALSE(table.setDetails(row.id, row.version, std::make_shared<EntryDetails>()));
    EXPECT_TRUE(table.setDetails(row.id, table.at(0).version, std::make_shared<EntryDetails>()));
}

/// Keys (for a whole folder) and comparisons (for one name) must agree, or a changed name would go
/// astray.
TEST_F(Table, sortingAndComparingAgreeOnHostileNames) {
    std::mt19937 random(7);
    const std::vector<std::string> parts{"a",  "B", "ä",       "10",     "9", "007",      " ",
                                         "-",  ".", "_",       "İ",      "ß", "\xff\xfe", "\x01",
                                         "漢", "ة", "e\u0301", "\u202e", "é"};
    std::map<std::string, bool> seen;
    std::vector<DocumentEntry> entries;
    while (entries.size() < 3000) {
        std::string name;
        for (unsigned i = 0; i <= random() % 6; ++i)
            name += parts[random() % parts.size()];
        if (seen.emplace(name, true).second)
            entries.push_back(random() % 5 ? file(name) : folder(name));
    }
    entries = sorted(std::move(entries));
    const NameOrder order;
    for (std::size_t i = 1; i < entries.size(); ++i)
        ASSERT_TRUE(order.before(entries[i - 1], entries[i]))
            << entries[i - 1].name << " | " << entries[i].name;
}

/// A thousand batches of random changes against a plain map, for several fixed seeds.
class Churn : public ::testing::TestWithParam<unsigned> {};

TEST_P(Churn, endsWhereAFreshReadingWould) {
    std::mt19937 random(GetParam());
    EntryTable table;
    std::map<std::string, RowId> truth; // 0: not known yet
    const auto someName = [&] { return "file " + std::to_string(random() % 60); };
    for (int batch = 0; batch < 1000; ++batch) {
        EntryChanges changes;
        std::vector<std::string> touched;
        for (unsigned i = 0; i <= random() % 5; ++i) {
            const std::string name = someName();
            const std::string other = someName();
            touched.insert(touched.end(), {name, other});
            if (random() % 3 == 0 && truth.contains(name) && name != other) {
                changes.renamings.push_back({name, other});
                const RowId row = truth[name];
                truth.erase(name);
                truth.try_emplace(other, row);
            } else if (random() % 2 && changes.renamings.empty()) {
                truth.erase(name);
            } else {
                truth.try_emplace(name, 0);
            }
        }
        for (const std::string& name : touched)
            changes.facts.push_back({file(name), truth.contains(name)});
        table.apply(changes);
        std::vector<DocumentEntry> fresh;
        for (auto& [name, row] : truth) {
            const EntryTable::Row* const shown = table.find(name);
            ASSERT_TRUE(shown) << name;
            if (row == 0)
                row = shown->id;
            fresh.push_back(file(name));
        }
        fresh = sorted(std::move(fresh));
        ASSERT_EQ(table.size(), fresh.size());
        for (std::size_t i = 0; i < fresh.size(); ++i) {
            ASSERT_EQ(table.at(i).entry.name, fresh[i].name);
            ASSERT_EQ(table.indexOf(table.at(i).id), i);
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Seeds, Churn, ::testing::Values(1U, 2U, 3U, 42U));

} // namespace
