#include "platform/documents/preview/MarkdownText.h"

#include <QString>

#include <array>
#include <cctype>
#include <map>
#include <md4c.h>

namespace platform {
namespace {

/// A table writes cells that its text does not have: a row of 3 letters can become thousands.
constexpr std::size_t mostGrowth = 24;
constexpr std::size_t smallText = 64UL * 1024;

class Writer {
public:
    Writer(std::string_view text, const std::function<bool()>& isUnwanted)
        : limit_(mostGrowth * (text.size() + smallText)), isUnwanted_(isUnwanted) {}

    std::string take() { return std::move(out_); }

    int enterBlock(MD_BLOCKTYPE type, void* detail) {
        switch (type) {
        case MD_BLOCK_H:
            heading_ = out_.size();
            out_ += '<' + headingName(detail) + '>';
            break;
        case MD_BLOCK_OL:
            out_ += "<ol start=\"" +
                    std::to_string(static_cast<MD_BLOCK_OL_DETAIL*>(detail)->start) + "\">";
            break;
        case MD_BLOCK_LI:
            out_ += itemStart(*static_cast<MD_BLOCK_LI_DETAIL*>(detail));
            break;
        case MD_BLOCK_TH:
        case MD_BLOCK_TD:
            out_ += cellStart(type, *static_cast<MD_BLOCK_TD_DETAIL*>(detail));
            break;
        case MD_BLOCK_HR:
            out_ += "<hr>";
            break;
        default:
            if (const std::string_view name = nameOf(type); !name.empty())
                out_.append("<").append(name).append(">");
        }
        return state();
    }

    int leaveBlock(MD_BLOCKTYPE type, void* detail) {
        if (type == MD_BLOCK_H) {
            out_ += "</" + headingName(detail) + '>';
            nameHeading();
        } else if (type == MD_BLOCK_OL || type == MD_BLOCK_LI || type == MD_BLOCK_TH ||
                   type == MD_BLOCK_TD) {
            static const std::map<int, std::string_view> names{
                {MD_BLOCK_OL, "ol"}, {MD_BLOCK_LI, "li"}, {MD_BLOCK_TH, "th"}, {MD_BLOCK_TD, "td"}};
            out_.append("</").append(names.at(type)).append(">");
        } else if (const std::string_view name = nameOf(type); !name.empty()) {
            if (type == MD_BLOCK_CODE && out_.ends_with('\n'))
                out_.pop_back();
            out_.append("</").append(name).append(">\n");
        }
        return state();
    }

    int enterSpan(MD_SPANTYPE type, void* detail) {
        if (type == MD_SPAN_IMG) {
            if (pictures_++ == 0) {
                out_ += "<img src=\"" + attribute(static_cast<MD_SPAN_IMG_DETAIL*>(detail)->src) +
                        "\" alt=\"";
            }
        } else if (pictures_ > 0) {
            return state(); // words for a picture have no shape
        } else if (type == MD_SPAN_A) {
            out_ += "<a href=\"" + attribute(static_cast<MD_SPAN_A_DETAIL*>(detail)->href) + "\">";
        } else if (const std::string_view name = nameOf(type); !name.empty()) {
            out_.append("<").append(name).append(">");
        }
        return state();
    }

    int leaveSpan(MD_SPANTYPE type, void* /*detail*/) {
        if (type == MD_SPAN_IMG) {
            if (--pictures_ == 0)
                out_ += "\">";
        } else if (pictures_ == 0) {
            const std::string_view name = type == MD_SPAN_A ? "a" : nameOf(type);
            if (!name.empty())
                out_.append("</").append(name).append(">");
        }
        return state();
    }

    int text(MD_TEXTTYPE type, std::string_view text) {
        switch (type) {
        case MD_TEXT_NULLCHAR:
            out_ += "\xEF\xBF\xBD";
            break;
        case MD_TEXT_BR:
            out_ += pictures_ > 0 ? " " : "<br>";
            break;
        case MD_TEXT_SOFTBR:
            out_ += '\n';
            break;
        case MD_TEXT_HTML:
            if (pictures_ == 0)
                out_ += text;
            break;
        case MD_TEXT_ENTITY:
            out_ += text;
            break;
        default:
            escape(text, out_);
        }
        return state();
    }

private:
    int state() const { return out_.size() > limit_ || isUnwanted_() ? 1 : 0; }

    static void escape(std::string_view text, std::string& out) {
        for (const char each : text) {
            if (each == '<')
                out += "&lt;";
            else if (each == '>')
                out += "&gt;";
            else if (each == '&')
                out += "&amp;";
            else if (each == '"')
                out += "&quot;";
            else
                out += each;
        }
    }

    static std::string attribute(const MD_ATTRIBUTE& value) {
        std::string out;
        escape({value.text, value.size}, out);
        return out;
    }

    static std::string headingName(void* detail) {
        return 'h' + std::to_string(static_cast<MD_BLOCK_H_DETAIL*>(detail)->level);
    }

    static std::string itemStart(const MD_BLOCK_LI_DETAIL& item) {
        if (!item.is_task)
            return "<li>";
        return item.task_mark == ' ' ? "<li class=\"unchecked\">" : "<li class=\"checked\">";
    }

    static std::string cellStart(MD_BLOCKTYPE type, const MD_BLOCK_TD_DETAIL& cell) {
        static constexpr std::array<std::string_view, 4> sides{"", "left", "center", "right"};
        std::string out = type == MD_BLOCK_TH ? "<th" : "<td";
        if (cell.align != MD_ALIGN_DEFAULT)
            out.append(" align=\"").append(sides[cell.align]).append("\"");
        return out + '>';
    }

    static std::string_view nameOf(MD_BLOCKTYPE type) {
        switch (type) {
        case MD_BLOCK_QUOTE:
            return "blockquote";
        case MD_BLOCK_UL:
            return "ul";
        case MD_BLOCK_CODE:
            return "pre";
        case MD_BLOCK_P:
            return "p";
        case MD_BLOCK_TABLE:
            return "table";
        case MD_BLOCK_TR:
            return "tr";
        default:
            return {};
        }
    }

    static std::string_view nameOf(MD_SPANTYPE type) {
        switch (type) {
        case MD_SPAN_EM:
            return "em";
        case MD_SPAN_STRONG:
            return "strong";
        case MD_SPAN_CODE:
            return "code";
        case MD_SPAN_DEL:
            return "del";
        default:
            return {};
        }
    }

    /// Links within the text find a heading by its words: small letters, dashes between them.
    void nameHeading() {
        const QString words = QString::fromStdString(out_.substr(heading_));
        QString name;
        bool tag = false;
        for (const QChar unit : words) {
            if (unit == u'<' || unit == u'>')
                tag = unit == u'<';
            else if (tag)
                continue;
            else if (unit.isLetterOrNumber() || unit == u'_' || unit == u'-')
                name += unit.toLower();
            else if (unit == u' ')
                name += u'-';
        }
        constexpr qsizetype longestName = 200;
        const std::size_t behindTag = heading_ + std::string_view("<h1").size();
        out_.insert(behindTag, " id=\"" + name.left(longestName).toStdString() + '"');
    }

    std::string out_;
    const std::size_t limit_;
    const std::function<bool()>& isUnwanted_;
    std::size_t heading_ = 0;
    /// How many pictures the words are for, one within the other.
    int pictures_ = 0;
};

Writer& writer(void* user) {
    return *static_cast<Writer*>(user);
}

} // namespace

std::optional<std::string> htmlOfMarkdown(std::string_view text,
                                          const std::function<bool()>& isUnwanted) {
    Writer target(text, isUnwanted);
    MD_PARSER parser{};
    parser.flags = MD_DIALECT_GITHUB;
    parser.enter_block = [](MD_BLOCKTYPE type, void* detail, void* user) {
        return writer(user).enterBlock(type, detail);
    };
    parser.leave_block = [](MD_BLOCKTYPE type, void* detail, void* user) {
        return writer(user).leaveBlock(type, detail);
    };
    parser.enter_span = [](MD_SPANTYPE type, void* detail, void* user) {
        return writer(user).enterSpan(type, detail);
    };
    parser.leave_span = [](MD_SPANTYPE type, void* detail, void* user) {
        return writer(user).leaveSpan(type, detail);
    };
    parser.text = [](MD_TEXTTYPE type, const MD_CHAR* content, MD_SIZE size, void* user) {
        return writer(user).text(type, {content, size});
    };
    if (::md_parse(text.data(), static_cast<MD_SIZE>(text.size()), &parser, &target) != 0)
        return std::nullopt;
    return target.take();
}

} // namespace platform
