#include "platform/documents/preview/SyntaxLanguage.h"

#include "platform/launch/TypeRegistry.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <map>
#include <set>
#include <string>

namespace platform {
namespace {

using Language = SyntaxLanguage;

constexpr SyntaxLanguage unknown{};

constexpr std::array languages{
    Language{"text/x-csrc text/x-chdr text/x-c++src text/x-c++hdr text/x-objcsrc text/x-objc++src "
             "text/x-opencl-src text/x-moc",
             "alignas alignof asm auto bool break case catch char char8_t char16_t char32_t class "
             "co_await co_return co_yield concept const consteval constexpr constinit const_cast "
             "continue decltype default delete do double dynamic_cast else enum explicit export "
             "extern false final float for friend goto if inline int long mutable namespace new "
             "noexcept nullptr operator override private protected public register "
             "reinterpret_cast requires return short signed sizeof static static_assert "
             "static_cast struct switch template this throw true try typedef typeid typename "
             "union unsigned using virtual void volatile wchar_t while",
             "//", "/* */", "\" '", "", Language::preprocessor},
    Language{"text/x-java text/x-csharp text/x-kotlin text/x-scala text/x-groovy text/x-gradle "
             "text/x-dsrc text/x-vala text/x-dart application/x-dart dyn.proto dyn.gradle",
             "abstract as async await boolean bool break byte case catch char class companion "
             "const continue data decimal default def delegate do double else enum event explicit "
             "extends extern false final finally float for foreach fun if implements import in "
             "init instanceof int interface internal is lateinit lazy let long match namespace "
             "native new null object open operator out override package params private protected "
             "public readonly record ref return sealed short static string struct super switch "
             "synchronized this throw throws trait transient true try type typeof uint ulong "
             "unsafe using val var virtual void volatile when where while with yield",
             "//", "/* */", "\" '", "\"\"\""},
    Language{"application/javascript text/javascript application/ecmascript text/x-typescript "
             "application/typescript text/x-qml dyn.jsx dyn.tsx dyn.mjs dyn.cjs dyn.vue",
             "abstract any as async await boolean break case catch class const continue debugger "
             "declare default delete do else enum export extends false finally for from function "
             "get if implements import in instanceof interface let module new null number of "
             "private property protected public readonly return set signal static string super "
             "switch this throw true try type typeof undefined var void while with yield",
             "//", "/* */", "\" '", "`"},
    Language{"text/x-go",
             "break case chan const continue default defer else fallthrough false for func go goto "
             "if import interface iota map nil package range return select struct switch true "
             "type var bool byte error float32 float64 int int8 int16 int32 int64 rune string "
             "uint uint8 uint16 uint32 uint64 uintptr any",
             "//", "/* */", "\" '", "`"},
    Language{"text/rust",
             "as async await box break const continue crate dyn else enum extern false fn for if "
             "impl in let loop match mod move mut pub ref return self Self static struct super "
             "trait true type union unsafe use where while bool char f32 f64 i8 i16 i32 i64 i128 "
             "isize str u8 u16 u32 u64 u128 usize String Vec Option Result Some None Ok Err",
             "//", "/* */", "", "\""},
    Language{"text/x-swift dyn.swift",
             "as associatedtype async await break case catch class continue default defer deinit "
             "do else enum extension fallthrough false for func guard if import in init inout "
             "internal is let nil open operator private protocol public repeat return self Self "
             "static struct subscript super switch throw throws true try typealias var where "
             "while",
             "//", "/* */", "\"", "\"\"\""},
    Language{"application/x-php",
             "abstract and array as break callable case catch class clone const continue declare "
             "default do echo else elseif empty extends false final finally fn for foreach "
             "function global if implements include include_once instanceof interface isset list "
             "match namespace new null or print private protected public readonly require "
             "require_once return static switch throw trait true try unset use var while xor "
             "yield",
             "// #", "/* */", "\" '", "", Language::dollarNames},
    Language{"text/css text/x-scss text/x-sass text/less", "", "//", "/* */", "\" '", "",
             Language::namesValues},
    Language{"text/x-python text/x-python3 text/x-cython text/x-meson",
             "and as assert async await break case class continue def del elif else except False "
             "finally for from global if import in is lambda match None nonlocal not or pass "
             "raise return self True try while with yield",
             "#", "", "\" '", "\"\"\" '''"},
    Language{"application/x-ruby",
             "alias and begin break case class def defined do else elsif end ensure false for if "
             "in module next nil not or redo rescue retry return self super then true undef "
             "unless until when while yield require require_relative attr_accessor attr_reader "
             "puts",
             "#", "=begin =end", "\" '"},
    Language{"application/x-perl",
             "and cmp default die do else elsif eq for foreach ge given gt if last le local lt my "
             "ne next no not or our package print qw redo require return sub unless until use "
             "when while xor",
             "#", "=pod =cut", "\" '", "", Language::wordComments | Language::dollarNames},
    Language{"application/x-shellscript text/x-csh application/x-fishscript",
             "alias break case cd continue declare do done echo elif else end esac eval exec exit "
             "export fi for function if in local printf read readonly return select set shift "
             "source then time trap unset until while",
             "#", "", "", "\" '", Language::wordComments | Language::dollarNames},
    Language{"text/x-makefile text/x-cmake text/x-dockerfile application/x-docker-file",
             "define else endef endfunction endforeach endif endmacro endwhile export foreach from "
             "function if ifdef ifeq ifndef ifneq include macro option override project set "
             "while run copy add cmd env arg workdir entrypoint expose label user volume",
             "#", "", "\"", "", Language::dollarNames | Language::ignoresCase},
    Language{"application/sql text/x-sql",
             "add all alter and as asc begin between bigint blob boolean by case cascade char "
             "check column commit constraint create cross current_date date decimal default delete "
             "desc distinct drop else end except exists false float foreign from full function "
             "group having if in index inner insert int integer intersect into is join key left "
             "like limit not null numeric offset on or order outer primary real references "
             "replace returning right rollback select set table text then timestamp to "
             "transaction trigger true union unique update using values varchar view when where "
             "with",
             "--", "/* */", "' \"", "", Language::ignoresCase | Language::doublesQuotes},
    Language{"text/x-lua",
             "and break do else elseif end false for function goto if in local nil not or repeat "
             "return then true until while",
             "--", "--[[ ]]", "\" '"},
    Language{"text/x-haskell",
             "case class data deriving do else if import in infix infixl infixr instance let "
             "module newtype of then type where",
             "--", "{- -}", "\""},
    Language{"text/x-tex text/x-bibtex", "", "%", "", "", ""},
    Language{"text/x-patch", "", "", "", "", "", Language::changes},
    Language{"application/json application/schema+json application/geo+json "
             "application/ld+json application/json-patch+json dyn.jsonl dyn.ndjson",
             "true false null", "//", "/* */", "\"", "", Language::namesValues},
    Language{"application/x-yaml application/yaml text/x-yaml", "true false null yes no on off",
             "#", "", "\" '", "", Language::wordComments | Language::namesValues},
    Language{"application/toml dyn.toml dyn.properties dyn.conf dyn.cfg application/x-desktop "
             "text/x-systemd-unit text/x-ini-file "
             "application/x-ini text/x-java-properties application/x-wine-extension-ini",
             "true false", "# ;", "", "\" '", "", Language::namesValues | Language::headings},
    Language{"application/xml text/html application/xhtml+xml image/svg+xml application/x-designer "
             "text/vnd.trolltech.linguist application/xslt+xml application/rss+xml "
             "application/atom+xml application/x-xliff dyn.plist",
             "", "", "<!-- -->", "", "", Language::markup},
};

using Words = std::set<std::string, std::less<>>;

Words wordsOf(std::string_view list) {
    Words words;
    while (!list.empty()) {
        const std::size_t end = std::min(list.find(' '), list.size());
        if (end > 0)
            words.emplace(list.substr(0, end));
        list.remove_prefix(std::min(end + 1, list.size()));
    }
    return words;
}

const std::map<std::string, const SyntaxLanguage*, std::less<>>& languagesByMimeType() {
    static const auto table = [] {
        std::map<std::string, const SyntaxLanguage*, std::less<>> out;
        for (const SyntaxLanguage& language : languages)
            for (const std::string& type : wordsOf(language.mimeTypes))
                out.emplace(type, &language);
        return out;
    }();
    return table;
}

} // namespace

bool SyntaxLanguage::isKeyword(std::string_view word) const {
    static const auto table = [] {
        std::map<const char*, Words> out;
        for (const SyntaxLanguage& language : languages)
            out.emplace(language.keywords.data(), wordsOf(language.keywords));
        return out;
    }();
    const auto words = table.find(keywords.data());
    if (words == table.end())
        return false;
    if (!has(ignoresCase))
        return words->second.contains(word);
    std::string lower(word);
    std::transform(lower.begin(), lower.end(), lower.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return words->second.contains(lower);
}

const SyntaxLanguage* syntaxLanguageFor(std::string_view typeIdentifier) {
    const std::string mime = TypeRegistry::mimeTypeForIdentifier(typeIdentifier);
    const bool unlisted = typeIdentifier.starts_with("dyn.");
    const auto found = languagesByMimeType().find(unlisted ? typeIdentifier : mime);
    if (found != languagesByMimeType().end())
        return found->second;
    if (TypeRegistry::conformsTo(typeIdentifier, "public.xml"))
        return languagesByMimeType().at("application/xml");
    if (TypeRegistry::conformsTo(typeIdentifier, types::sourceCode))
        return &unknown;
    return nullptr;
}

} // namespace platform
