#include "tools/pelmora/SampleTexts.h"

#include <array>
#include <random>

namespace pelmora {
namespace {

constexpr std::array subjects{"The gardener",
                              "Our neighbour",
                              "The old ferry",
                              "My sister",
                              "A letter from the council",
                              "The stove in the kitchen",
                              "The committee",
                              "Nobody in the village",
                              "The younger dog"};
constexpr std::array verbs{
    "has been waiting for",     "keeps talking about", "never quite understood",
    "was surprised by",         "brought back",        "paid twice for",
    "would rather not mention", "finally repaired",    "still dreams of"};
constexpr std::array objects{
    "the new bridge",           "a box of apples", "the wet summer",
    "the missing key",          "three invoices",  "the photographs from the lake",
    "the roof above the study", "a quiet evening", "the timetable on the door"};
constexpr std::array ends{".",
                          " since last spring.",
                          ", and that was that.",
                          ", as everybody expected.",
                          " without saying why.",
                          " before the rain came."};

template<class List>
const char* pick(const List& list, std::mt19937& random) {
    return list[random() % list.size()];
}

std::string sentence(std::mt19937& random) {
    return std::string(pick(subjects, random)) + ' ' + pick(verbs, random) + ' ' +
           pick(objects, random) + pick(ends, random);
}

} // namespace

std::string prose(unsigned seed, int sentences) {
    std::mt19937 random(seed);
    std::string text;
    for (int i = 0; i < sentences; ++i) {
        if (i > 0)
            text += ' ';
        text += sentence(random);
    }
    return text;
}

std::string logOfSize(std::uint64_t size) {
    std::mt19937 random(1848);
    std::string text;
    text.reserve(size + 200);
    for (int day = 1; text.size() < size; ++day)
        text += "Day " + std::to_string(day) + ", wind " + std::to_string(random() % 9) + ". " +
                sentence(random) + '\n';
    text.resize(size);
    text.back() = '\n';
    return text;
}

std::string budgetCsv(int year) {
    std::mt19937 random(static_cast<unsigned>(year));
    constexpr std::array months{"January",   "February", "March",    "April",
                                "May",       "June",     "July",     "August",
                                "September", "October",  "November", "December"};
    std::string table = "Month,Rent,Food,Travel,Repairs,Total\n";
    for (const char* month : months) {
        const unsigned food = 310 + static_cast<unsigned>(random() % 120);
        const unsigned travel = static_cast<unsigned>(random() % 260);
        const unsigned repairs = random() % 3 == 0 ? static_cast<unsigned>(random() % 400) : 0;
        table += std::string(month) + ",840," + std::to_string(food) + ',' +
                 std::to_string(travel) + ',' + std::to_string(repairs) + ',' +
                 std::to_string(840 + food + travel + repairs) + '\n';
    }
    return table;
}

} // namespace pelmora
