#include "platform/launch/TypeRegistry.h"
#include "platform/base/Text.h"

#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <thread>

using platform::TypeRegistry;
namespace types = platform::types;

namespace {

std::string typeOf(std::string_view name) {
    return TypeRegistry::identifierForFileName(name);
}

/// The families among those that product code asks for, as one word.
std::string familiesOf(std::string_view name) {
    const std::string type = typeOf(name);
    std::string out;
    for (const auto& [family, letter] :
         {std::pair(types::image, 'i'), std::pair(types::movie, 'm'), std::pair(types::audio, 'a'),
          std::pair(types::audiovisual, 'v'), std::pair(types::text, 't'),
          std::pair(types::plainText, 'p'), std::pair(types::sourceCode, 's'),
          std::pair(types::archive, 'z'), std::pair(types::compositeContent, 'c'),
          std::pair(types::content, 'C'), std::pair(types::data, 'D'),
          std::pair(types::package, 'P'), std::pair(types::directory, 'F')})
        if (TypeRegistry::conformsTo(type, family))
            out += letter;
    return out;
}

TEST(Types, TheWellKnownHaveNamesOfTheirOwn) {
    EXPECT_EQ(typeOf("a.png"), "public.png");
    EXPECT_EQ(typeOf("a.JPG"), "public.jpeg");
    EXPECT_EQ(typeOf("a.pdf"), types::pdf);
    EXPECT_EQ(typeOf("a.svg"), types::svg);
    EXPECT_EQ(typeOf("a.txt"), types::plainText);
    EXPECT_EQ(typeOf("a.html"), types::html);
    EXPECT_EQ(typeOf("a.csv"), types::csv);
    EXPECT_EQ(typeOf("a.md"), types::markdown);
    EXPECT_EQ(typeOf("a.mp4"), "public.mpeg-4");
    EXPECT_EQ(typeOf("a.mp3"), "public.mp3");
    EXPECT_EQ(typeOf("a.zip"), "public.zip-archive");
    EXPECT_EQ(typeOf("archive.tar.gz"), "public.gzip-tar-archive");
    EXPECT_EQ(typeOf("Makefile"), "public.make-source");
    EXPECT_EQ(typeOf("no extension"), types::data);
    EXPECT_EQ(typeOf("Offer.XYZZY"), "dyn.xyzzy");
}

TEST(Types, NamesThatEndAlikeMayStillDiffer) {
    EXPECT_EQ(typeOf("lists.txt"), types::plainText);
    EXPECT_EQ(typeOf("CMakeLists.txt"), "org.freedesktop.mime.text.x-cmake");
    EXPECT_EQ(typeOf("picture.gz"), "public.gzip-archive");
    EXPECT_EQ(typeOf("v1.2 picture.svg.gz"), "org.freedesktop.mime.image.svg+xml-compressed");
    EXPECT_EQ(typeOf("README.xyzzy"), "org.freedesktop.mime.text.x-readme");
    EXPECT_EQ(typeOf("a.c"), "public.c-source");
    EXPECT_EQ(typeOf("a.C"), "public.c-plus-plus-source") << "case tells these apart";
    EXPECT_EQ(typeOf(".xyzzy"), types::data) << "a hidden name is no extension";
    EXPECT_EQ(typeOf("a.xyzzy"), "dyn.xyzzy");
}

TEST(Types, FamiliesAreThoseThatAPersonExpects) {
    EXPECT_EQ(familiesOf("a.png"), "iCD");
    EXPECT_EQ(familiesOf("a.svg"), "itpCD") << "a picture that is written as text";
    EXPECT_EQ(familiesOf("a.mp4"), "mvCD");
    EXPECT_EQ(familiesOf("a.flac"), "avCD");
    EXPECT_EQ(familiesOf("a.txt"), "tpCD");
    EXPECT_EQ(familiesOf("a.json"), "tpCD");
    EXPECT_EQ(familiesOf("a.rtf"), "tcCD") << "not plain";
    EXPECT_EQ(familiesOf("a.py"), "tpsCD");
    EXPECT_EQ(familiesOf("a.cpp"), "tpsCD");
    EXPECT_EQ(familiesOf("a.sh"), "tpsCD");
    EXPECT_EQ(familiesOf("a.pdf"), "cCD");
    EXPECT_EQ(familiesOf("a.odt"), "cCD") << "packed, but no archive";
    EXPECT_EQ(familiesOf("a.epub"), "cCD");
    EXPECT_EQ(familiesOf("a.zip"), "zD");
    EXPECT_EQ(familiesOf("a.tar.xz"), "zD");
    EXPECT_EQ(familiesOf("a.xyzzy"), "D");
    EXPECT_EQ(familiesOf("a.rtfd"), "cCPF");
}

TEST(Types, EveryMimeTypeHasAnIdentifierThatLeadsBack) {
    for (const char* mime : {"image/png", "application/x-lha", "image/vnd.djvu",
                             "application/vnd.oasis.opendocument.text", "text/x-foo+bar.baz"})
        EXPECT_EQ(TypeRegistry::mimeTypeForIdentifier(TypeRegistry::identifierForMimeType(mime)),
                  mime);
    EXPECT_EQ(TypeRegistry::identifierForMimeType("Text/Plain; charset=utf-8"), types::plainText);
    EXPECT_EQ(TypeRegistry::identifierForMimeType("text/rtf"), "public.rtf") << "an alias";
    EXPECT_EQ(TypeRegistry::identifierForMimeType("nonsense"), types::data);
    EXPECT_EQ(TypeRegistry::mimeTypeForIdentifier("dyn.xyzzy"), "application/octet-stream");
    EXPECT_EQ(TypeRegistry::mimeTypeForIdentifier("com.example.unheard-of"),
              "application/octet-stream");
    EXPECT_TRUE(TypeRegistry::conformsTo("org.freedesktop.mime.image.x-new", types::image))
        << "by its group, although nobody knows it";
    EXPECT_TRUE(TypeRegistry::conformsTo("com.example.own", "com.example.own"));
    EXPECT_FALSE(TypeRegistry::conformsTo("com.example.own", types::data));
    EXPECT_TRUE(TypeRegistry::conformsTo("PUBLIC.PNG", "Public.Image"));
}

TEST(Types, ExtensionsOfAnyCaseHaveOne) {
    EXPECT_EQ(TypeRegistry::preferredIdentifierForExtension(""), std::nullopt);
    EXPECT_EQ(TypeRegistry::preferredIdentifierForExtension("PnG"), "public.png");
    EXPECT_EQ(TypeRegistry::preferredIdentifierForExtension("C"), "public.c-source");
    EXPECT_EQ(TypeRegistry::preferredIdentifierForExtension("Q!ü"), "dyn.q!ü");
    EXPECT_EQ(TypeRegistry::preferredIdentifierForExtension("rtfd"), "public.rtfd");
}

TEST(Types, PackagesGoByTheirNames) {
    EXPECT_TRUE(TypeRegistry::isPackageName("Letter.RTFD"));
    EXPECT_TRUE(TypeRegistry::isPackageName("x.tavrinpack"));
    EXPECT_FALSE(TypeRegistry::isPackageName(".rtfd"));
    EXPECT_FALSE(TypeRegistry::isPackageName("Pictures.d"));
}

TEST(Types, WhatStandsThereDecidesWhenTheNameDoesNot) {
    const test::TemporaryFolder folder;
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.write("no name", "%PDF-1.5\n")), types::pdf);
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.write("a.txt", "%PDF-1.5\n")),
              types::plainText);
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.write("unreadable \xff.png")), "public.png");
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.write("empty")), types::data);
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.write("x.xyzzy", "words")), types::plainText);
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.makeFolder("a.png")), types::folder);
    EXPECT_EQ(TypeRegistry::identifierForFile(folder.makeFolder("a.rtfd")), "public.rtfd");
    EXPECT_EQ(TypeRegistry::identifierForFile(folder / "promised.pdf"), types::pdf);
}

TEST(Types, HaveWordsInTheUsersLanguage) {
    EXPECT_EQ(TypeRegistry::localizedDescription("public.png"), "PNG image");
    EXPECT_EQ(TypeRegistry::localizedDescription("public.plain-text"), "Plain text document");
    EXPECT_EQ(TypeRegistry::localizedDescription("public.folder"), "Folder");
    EXPECT_EQ(TypeRegistry::localizedDescription("dyn.xyzzy"), std::nullopt);
}

TEST(Types, HaveIconsFromTheSpecialToTheGeneral) {
    const auto names = TypeRegistry::iconNames("public.png");
    EXPECT_EQ(names.front(), "image-png");
    EXPECT_NE(std::find(names.begin(), names.end(), "image-x-generic"), names.end());
    EXPECT_EQ(TypeRegistry::iconNames("public.folder").front(), "folder");
    EXPECT_EQ(TypeRegistry::iconNames("dyn.xyzzy").back(), "unknown");
}

TEST(Types, AnswerManyThreadsAlike) {
    std::vector<std::thread> threads;
    std::atomic<int> wrong{0};
    for (int t = 0; t < 4; ++t)
        threads.emplace_back([&wrong, t] {
            for (int i = 0; i < 2000; ++i) {
                const std::string extension = "x" + std::to_string((i * 7 + t) % 1000);
                wrong +=
                    TypeRegistry::preferredIdentifierForExtension(extension) != "dyn." + extension;
                wrong += !TypeRegistry::conformsTo(typeOf("a.png"), types::image);
                wrong += !TypeRegistry::conformsTo("dyn." + extension, types::data);
            }
        });
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(wrong, 0);
}

} // namespace
