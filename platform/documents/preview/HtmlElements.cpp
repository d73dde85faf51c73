#include "platform/documents/preview/HtmlElements.h"

#include <QHash>

#include <array>
#include <deque>

namespace platform {
namespace {

/// Elements of one role, separated by spaces; "a=b" is written as b.
struct Family {
    HtmlRole role;
    std::string_view names;
};

constexpr std::array families{
    Family{
        HtmlRole::dropped,
        "script style head title template iframe object embed applet svg math audio video canvas "
        "select textarea noscript map frameset xmp noembed"},
    Family{HtmlRole::alone, "br hr img"},
    Family{HtmlRole::text, "a b strong i em u ins=u s del=s strike=s code kbd=code samp=code "
                           "tt=code var=i q=i cite=i dfn=i small big sub sup mark=b span"},
    Family{HtmlRole::item, "li dt dd"},
    Family{HtmlRole::block,
           "p div h1 h2 h3 h4 h5 h6 ul ol dl blockquote pre center address=div section=div "
           "article=div header=div footer=div nav=div main=div aside=div figure=div "
           "figcaption=div details=div summary=div form=div fieldset=div legend=div caption=div "
           "body=div"},
    Family{HtmlRole::table, "table"},
    Family{HtmlRole::row, "tr"},
    Family{HtmlRole::cell, "td th"},
};

using Table = QHash<QString, const HtmlElement*>;

Table makeTable() {
    static std::deque<HtmlElement> elements;
    Table table;
    for (const Family& family : families) {
        std::string_view rest = family.names;
        while (!rest.empty()) {
            const std::size_t end = rest.find(' ');
            const std::string_view entry = rest.substr(0, end);
            rest.remove_prefix(end == std::string_view::npos ? rest.size() : end + 1);
            const std::size_t sign = entry.find('=');
            const std::string_view name = entry.substr(0, sign);
            const std::string_view written =
                sign == std::string_view::npos ? name : entry.substr(sign + 1);
            const auto text = [](std::string_view latin) {
                return QString::fromLatin1(latin.data(), static_cast<qsizetype>(latin.size()));
            };
            elements.push_back({name, family.role, text(written)});
            table.insert(text(name), &elements.back());
        }
    }
    return table;
}

} // namespace

const HtmlElement* htmlElement(const QString& name) {
    static const Table table = makeTable();
    return table.value(name, nullptr);
}

} // namespace platform
