#include "tools/pelmora/SampleStore.h"

#include "tools/pelmora/SamplePages.h"
#include "tools/pelmora/SamplePictures.h"
#include "tools/pelmora/SampleSound.h"
#include "tools/pelmora/SampleTexts.h"

#include <QImage>

#include <array>

namespace pelmora {
namespace {

/// The size from which on a document is not fetched without being asked for, and one byte less.
constexpr std::uint64_t largeDocument = 6'291'456;
/// Above what the window shows without asking.
constexpr std::uint64_t hugeDocument = 120ULL * 1024 * 1024;

std::string letterText(unsigned seed, const char* greeting, const char* name) {
    return std::string(greeting) + "\n\n" + prose(seed, 9) + "\n\n" + prose(seed + 1, 7) +
           "\n\nYours,\n" + name + '\n';
}

std::string invoicePdf(int number, double amount) {
    return pdfBytes("Invoice " + std::to_string(number),
                    {{"Workshop Lindqvist, Harbour Street 4",
                      {"For work on the boat and the small shed, as agreed in spring.",
                       "Hours: 14. Material: planed larch, screws, two litres of oil.",
                       "Amount due: " + std::to_string(static_cast<int>(amount)) +
                           ".00, payable within thirty days."},
                      {},
                      ""}});
}

std::string reportPdf(const std::string& title, unsigned seed, int pages) {
    std::vector<PageText> all;
    for (int i = 0; i < pages; ++i) {
        const unsigned page = seed + static_cast<unsigned>(i) * 10;
        std::vector<double> figure;
        for (unsigned bar = 0; bar < 12; ++bar)
            figure.push_back(3 + (page * 7 + bar * bar * 5) % 23);
        all.push_back(
            {"Part " + std::to_string(i + 1),
             {prose(page, 8), prose(page + 1, 6), prose(page + 2, 7)},
             figure,
             "Figure " + std::to_string(i + 1) + ". The months from January to December."});
    }
    return pdfBytes(title, all);
}

void addDocuments(SampleFolder& sample) {
    sample.write(
        "Documents/Welcome.md",
        "# Welcome\n\nThis folder holds a *sample* of documents.\n\n- Letters\n- Travel\n- "
        "Invoices\n\n> Nothing here is anybody's.\n\n| Day | Plan |\n|---|---|\n| Monday | "
        "Sort the photographs |\n| Friday | Pay the invoices |\n");
    sample.write("Documents/House Rules.pdf", reportPdf("House Rules", 3, 4));
    sample.write("Documents/Budget 2026.csv", budgetCsv(2026));
    sample.write(
        "Documents/Reading List.html",
        "<!doctype html><html><head><meta charset=\"utf-8\"><title>Reading List</title>"
        "</head><body><h1>Reading List</h1><ol><li>The tides, a handbook</li><li>Stoves and "
        "their repair</li><li>Letters from the north</li></ol><p>" +
            prose(70, 6) + "</p></body></html>\n");
    sample.write("Documents/Shopping.txt", "bread\nbutter\nnails, 40 mm\n");
    sample.write("Documents/Lake House.svg", floorPlanSvg());
    sample.write("Documents/Long Story.txt", prose(5, 3000));
    sample.write("Documents/Ship's Log.txt", logOfSize(largeDocument - 1));
    sample.write("Documents/Coast Panorama.png",
                 pngOfSize(landscape(11, 1600, 900), largeDocument));
    sample.writeSparse("Documents/Old Laptop.img", hugeDocument);
    sample.write("Documents/Empty Note.txt", "");
    sample.write("Documents/Archive/2019/Taxes/Receipts/March/Week 12/Ferry.txt",
                 "2 adults, 1 dog\n");
    sample.write("Documents/Archive/2019/Taxes/Return.pdf", reportPdf("Tax Return 2019", 19, 3));
    sample.write(
        "Documents/Archive/2021/Garden Plan.rtfd/TXT.rtf",
        "{\\rtf1\\ansi\\deff0 {\\b Garden plan}\\par Beans along the fence, potatoes behind "
        "the shed.\\par}\n");
    sample.write("Documents/Archive/2021/Garden Plan.rtfd/plan.png",
                 pngBytes(pattern(9, 640, 480)));
}

void addNames(SampleFolder& sample) {
    // Japanese, Russian, Arabic, Hebrew, Greek and Hindi, and a letter in two encodings of one
    // name.
    sample.write("Documents/文書/年賀状.txt",
                 "明けましておめでとうございます。\n今年もよろしくお願いいたします。\n");
    sample.write("Documents/文書/旅行の計画.md", "# 旅行の計画\n\n1. 京都\n2. 奈良\n");
    sample.write("Documents/Письма/Письмо бабушке.txt", "Дорогая бабушка!\n\nУ нас всё хорошо.\n");
    sample.write("Documents/مستندات/رسالة.txt", "السلام عليكم،\n\nنحن بخير والحمد لله.\n");
    sample.write("Documents/Names/שלום.txt", "שלום לכולם\n");
    sample.write("Documents/Names/Καλημέρα.txt", "Καλημέρα κόσμε\n");
    sample.write("Documents/Names/नमस्ते.txt", "नमस्ते दुनिया\n");
    sample.write("Documents/Names/Caf\u00e9.txt", "composed\n");
    sample.write("Documents/Names/Cafe\u0301 2.txt", "decomposed\n");
    sample.write("Documents/Names/Minutes of the " + std::string(200, 'v') +
                     "ery long meeting of the club.txt",
                 "It went on.\n");
    sample.write("Documents/Names/100 % wool, “fine” & soft.txt", "Wash by hand.\n");
}

void addLetters(SampleFolder& sample) {
    sample.write("Letters/.container.json", R"({
    "identifier": "com.example.letters",
    "names": {"": "Letters", "de": "Briefe", "ru": "Письма", "ar": "رسائل"},
    "folderLevels": "none",
    "documentTypes": [
        {"name": "Letter", "contentTypes": ["public.plain-text", "public.pdf"]},
        {"name": "Draft", "contentTypes": ["public.markdown"]}
    ]
})");
    sample.write("Letters/To the Harbour Office.txt", letterText(41, "Dear Sirs,", "A. Lindqvist"));
    sample.write("Letters/Birthday.txt", letterText(47, "Dear Nora,", "Uncle Tom"));
    sample.write("Letters/Complaint about the Stove.pdf",
                 reportPdf("Complaint about the Stove", 51, 2));
    sample.write("Letters/Draft.md", "# Draft\n\n" + prose(59, 4) + "\n");
}

void addInvoices(SampleFolder& sample) {
    sample.write("Invoices/.container.json", R"({
    "identifier": "com.example.invoices",
    "names": {"": "Invoices", "de": "Rechnungen"},
    "folderLevels": "one",
    "documentTypes": [{"name": "Invoice", "contentTypes": ["public.pdf"]}]
})");
    for (int i = 0; i < 5; ++i)
        sample.write("Invoices/" + std::to_string(2024 + i % 3) + "/Invoice " +
                         std::to_string(1017 + i) + ".pdf",
                     invoicePdf(1017 + i, 180 + 57 * i));
    sample.write("Invoices/Invoice 1000.pdf", invoicePdf(1000, 90));
}

void addTravel(SampleFolder& sample) {
    sample.write("Travel/.container.json",
                 R"({"identifier": "com.example.travel", "names": {"": "Travel", "de": "Reisen"},
 "folderLevels": "any"})");
    sample.write("Travel/Packing.md", "# Packing\n\n- [x] Boots\n- [ ] Maps\n- [ ] Rope\n");
    sample.write("Travel/North/Ferry Timetable.csv",
                 "Day,Out,Back\nMonday,08:10,17:40\nThursday,09:30,18:05\nSunday,10:00,16:20\n");
    sample.write("Travel/North/Islands/Guide to the Islands.pdf",
                 reportPdf("Guide to the Islands", 90, 5));
    sample.write("Travel/North/Islands/Harbour.jpg", jpegBytes(landscape(6, 1400, 1000)));
    sample.write("Travel/Lake House/Ground Floor.svg", floorPlanSvg());
    sample.write("Travel/Club Minutes.md", "# Minutes\n\n" + prose(77, 5) + "\n");
    sample.share("Travel/Lake House", "owner");
    sample.share("Travel/Club Minutes.md", "participant");
    sample.share("Travel/North/Islands/Guide to the Islands.pdf", "participant");
}

void addPhotos(SampleFolder& sample) {
    sample.write("Photos/.container.json", R"({
    "identifier": "com.example.photos",
    "names": {"": "Photos", "de": "Fotos"},
    "documentTypes": [{"name": "Picture", "contentTypes": ["public.image", "public.movie"]}]
})");
    constexpr std::array names{"Evening at the Lake", "First Snow", "From the Ferry", "Hills",
                               "Morning Fog",         "Road North", "The Bay"};
    for (std::size_t i = 0; i < names.size(); ++i)
        sample.write("Photos/Summer/" + std::string(names[i]) + ".jpg",
                     jpegBytes(landscape(static_cast<unsigned>(20 + i), 1600, 1200)));
    for (unsigned i = 1; i <= 6; ++i)
        sample.write("Photos/Quilt " + std::to_string(i) + ".png", pngBytes(pattern(i, 800, 600)));
    sample.write("Photos/Tall.png", pngBytes(landscape(33, 500, 1500)));
}

void addOthers(SampleFolder& sample) {
    // Its documents lie in a folder of their own.
    sample.write("Music/.container.json", R"({
    "identifier": "com.example.music",
    "names": {"": "Music", "de": "Musik"},
    "documents": "Documents",
    "folderLevels": "one",
    "documentTypes": [{"name": "Recording", "contentTypes": ["public.audio"]}]
})");
    sample.write("Music/Documents/Kitchen Tune.wav", tuneWav());
    sample.write("Music/Documents/Practice/Kitchen Tune, slow.wav", tuneWav());
    // No description: the folder itself is the container, and takes everything.
    sample.write("Notes/Call the Roofer.txt", "Tuesday, before ten.\n");
    sample.write("Notes/Ideas.md", "# Ideas\n\n1. A bench by the water\n2. Fewer meetings\n");
    sample.makeFolder("Notes/Later");
}

void addTags(SampleFolder& sample) {
    sample.write(".pelmora/keyvalue.json", R"({
    "KolviTagDict": {
        "KolviTagDictVersion": 2,
        "KolviTags": [
            {"n": "Someday", "l": 0},
            {"n": "Paper", "l": 1},
            {"n": "Garden", "l": 2},
            {"n": "Family", "l": 3},
            {"n": "Travel", "l": 4},
            {"n": "Waiting", "l": 5},
            {"n": "Important", "l": 6},
            {"n": "Home", "l": 7}
        ]
    }
}
)");
    sample.tag("Documents/House Rules.pdf", "Home,Important");
    sample.tag("Documents/Budget 2026.csv", "Paper");
    sample.tag("Documents/Long Story.txt", "Someday");
    sample.tag("Letters/Birthday.txt", "Family");
    sample.tag("Letters/Complaint about the Stove.pdf", "Waiting,Home,Paper");
    sample.tag("Travel/North/Islands/Harbour.jpg", "Travel");
    sample.tag("Documents/Archive/2021/Garden Plan.rtfd", "Garden");
    sample.tag("Photos/Summer/The Bay.jpg", "Travel,Family,Someday,Garden");
}

void setDates(SampleFolder& sample) {
    sample.date("Documents/House Rules.pdf", 2019, 5, 2);
    sample.date("Documents/Budget 2026.csv", 2026, 1, 3);
    sample.date("Documents/Long Story.txt", 2014, 11, 30);
    sample.date("Documents/Archive/2019/Taxes/Return.pdf", 2020, 2, 28);
    sample.date("Letters/Birthday.txt", 2023, 8, 17);
    sample.date("Letters/To the Harbour Office.txt", 2024, 3, 9);
    sample.date("Travel/North/Islands/Harbour.jpg", 2022, 7, 14);
    sample.date("Photos/Summer/The Bay.jpg", 2022, 7, 15);
}

} // namespace

platform::Failure makeSampleStore(const std::string& root) {
    SampleFolder sample(root);
    sample.makeFolder("Documents");
    for (const auto add : {&addDocuments, &addNames, &addLetters, &addInvoices, &addTravel,
                           &addPhotos, &addOthers, &addTags, &setDates}) {
        if (sample.failure())
            break;
        add(sample);
    }
    return sample.failure();
}

} // namespace pelmora
