#include "LayoutParser.h"

#include <algorithm>
#include <climits>
#include <cstdio>
#include <set>

namespace {

enum class TokenType { end, open, close, comma, number, unknown };

struct Token {
    TokenType type = TokenType::end;
    int kind = 0;     // group kind of an opening or closing bracket
    int value = 0;    // a number's value, saturated at INT_MAX
    char symbol = 0;  // the character of an unknown token
};

// Characters below 33 taken as signed 8-bit values: blanks, control characters and every
// byte from 128 on.
bool IsSkipped(char c) {
    return static_cast<signed char>(c) < 33;
}
bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}

class CLayoutScanner {
  public:
    explicit CLayoutScanner(std::string_view text) : m_text(text) {}

    Token Next() {
        SkipBlanks(m_pos);
        if (m_pos >= m_text.size()) {
            return {};
        }
        const char c = m_text[m_pos];
        if (IsDigit(c)) {
            return {TokenType::number, 0, ReadNumber(m_pos), 0};
        }
        ++m_pos;
        switch (c) {
            case '(':
                return {TokenType::open, kLayoutHorizontal, 0, 0};
            case '{':
                return {TokenType::open, kLayoutVertical, 0, 0};
            case '[':
                return {TokenType::open, kLayoutTabular, 0, 0};
            case ')':
                return {TokenType::close, kLayoutHorizontal, 0, 0};
            case '}':
                return {TokenType::close, kLayoutVertical, 0, 0};
            case ']':
                return {TokenType::close, kLayoutTabular, 0, 0};
            case ',':
                return {TokenType::comma, 0, 0, 0};
            default:
                return {TokenType::unknown, 0, 0, c};
        }
    }

    // Reads " < n > " after an item; consumes nothing and returns -1 when the text that follows
    // does not have exactly that form.
    int SizeSuffix() {
        std::size_t pos = m_pos;
        SkipBlanks(pos);
        if (pos >= m_text.size() || m_text[pos] != '<') {
            return -1;
        }
        SkipBlanks(++pos);
        if (pos >= m_text.size() || !IsDigit(m_text[pos])) {
            return -1;
        }
        const int value = ReadNumber(pos);
        SkipBlanks(pos);
        if (pos >= m_text.size() || m_text[pos] != '>') {
            return -1;
        }
        m_pos = pos + 1;
        return value;
    }

  private:
    void SkipBlanks(std::size_t& pos) const {
        while (pos < m_text.size() && IsSkipped(m_text[pos])) {
            ++pos;
        }
    }

    int ReadNumber(std::size_t& pos) const {
        long long value = 0;
        for (; pos < m_text.size() && IsDigit(m_text[pos]); ++pos) {
            value = std::min<long long>(value * 10 + (m_text[pos] - '0'), INT_MAX);
        }
        return static_cast<int>(value);
    }

    std::string_view m_text;
    std::size_t m_pos = 0;
};

// Puts a just-completed group into its parent: an empty tab group vanishes, a group of at most
// one member or of the parent's own kind gives way to its members. Members that move up are
// judged again against their new parent, so that composing and parsing a layout once more
// gives the same tree (and the sizes stored under its text fit it).
void AppendNormalised(CLayoutItem& parent, CLayoutItem&& item) {
    if (item.IsPane()) {
        parent.children.push_back(std::move(item));
        return;
    }
    if (item.IsTabular() && item.children.empty()) {
        return;
    }
    if (item.children.size() <= 1 || item.kind == parent.kind) {
        for (CLayoutItem& child : item.children) {
            AppendNormalised(parent, std::move(child));
        }
        return;
    }
    parent.children.push_back(std::move(item));
}

CLayoutParseResult Failure(int code, char symbol = '?') {
    CLayoutParseResult result;
    result.error = code;
    result.message = LayoutErrorMessage(code, symbol);
    return result;
}

}  // namespace

std::string LayoutErrorMessage(int code, char symbol) {
    switch (code) {
        case kLayoutOk:
            return {};
        case kLayoutUnknownSymbol:
            return std::string("Unknow symbol `") + symbol + "`";
        case kLayoutSyntaxError:
            return "Syntax error";
        case kLayoutUnexpectedEnd:
            return "Enexpected end of Layout string";
        case kLayoutWrongViewNumber:
            return "Using wrong view number";
        case kLayoutDuplicateViewNumber:
            return "Dublicate using view number";
        default: {
            char text[40];
            std::snprintf(text, sizeof text, "Unknow error 0x%X", static_cast<unsigned>(code));
            return text;
        }
    }
}

// Iterative, so that deeply nested input cannot exhaust the stack.
CLayoutParseResult ParseLayout(std::string_view text, int paneCount) {
    CLayoutScanner scanner(text);
    Token token = scanner.Next();
    if (token.type != TokenType::open) {
        return Failure(kLayoutSyntaxError);
    }
    std::vector<CLayoutItem> open(1);
    open.back().kind = token.kind;
    std::set<int> used;
    CLayoutItem outermost;
    while (!open.empty()) {
        token = scanner.Next();
        switch (token.type) {
            case TokenType::end:
                return Failure(kLayoutUnexpectedEnd);
            case TokenType::unknown:
                return Failure(kLayoutUnknownSymbol, token.symbol);
            case TokenType::comma:
                break;
            case TokenType::number: {
                if (token.value >= paneCount) {
                    return Failure(kLayoutWrongViewNumber);
                }
                if (!used.insert(token.value).second) {
                    return Failure(kLayoutDuplicateViewNumber);
                }
                CLayoutItem pane;
                pane.kind = token.value;
                pane.sizeSuffix = scanner.SizeSuffix();
                open.back().children.push_back(std::move(pane));
                break;
            }
            case TokenType::open:
                open.emplace_back().kind = token.kind;
                break;
            case TokenType::close: {
                if (token.kind != open.back().kind) {
                    return Failure(kLayoutSyntaxError);
                }
                CLayoutItem group = std::move(open.back());
                open.pop_back();
                group.sizeSuffix = scanner.SizeSuffix();
                if (open.empty()) {
                    outermost = std::move(group);
                } else {
                    AppendNormalised(open.back(), std::move(group));
                }
                break;
            }
        }
    }
    if (scanner.Next().type != TokenType::end) {
        return Failure(kLayoutSyntaxError);
    }
    CLayoutParseResult result;
    if (outermost.children.size() == 1) {
        result.root = std::move(outermost.children.front());
    } else {
        result.root = std::move(outermost);
    }
    return result;
}

namespace {

void Compose(const CLayoutItem& item, std::string& out) {
    if (item.IsPane()) {
        out += std::to_string(item.kind);
        return;
    }
    const char* brackets = item.kind == kLayoutVertical ? "{}" : item.IsTabular() ? "[]" : "()";
    out += brackets[0];
    for (std::size_t i = 0; i < item.children.size(); ++i) {
        if (i > 0) {
            out += ',';
        }
        Compose(item.children[i], out);
    }
    out += brackets[1];
}

template <class Item>
void CollectGroups(Item& item, std::vector<Item*>& groups) {
    if (item.IsPane()) {
        return;
    }
    groups.push_back(&item);
    for (auto& child : item.children) {
        CollectGroups(child, groups);
    }
}

void CollectPanes(const CLayoutItem& item, std::vector<int>& panes) {
    if (item.IsPane()) {
        panes.push_back(item.kind);
    }
    for (const CLayoutItem& child : item.children) {
        CollectPanes(child, panes);
    }
}

}  // namespace

std::string ComposeLayout(const CLayoutItem& item) {
    std::string out;
    if (item.IsPane()) {
        return "(" + std::to_string(item.kind) + ")";
    }
    Compose(item, out);
    return out;
}

std::vector<const CLayoutItem*> GroupsInPreOrder(const CLayoutItem& root) {
    std::vector<const CLayoutItem*> groups;
    CollectGroups(root, groups);
    return groups;
}

std::vector<CLayoutItem*> GroupsInPreOrder(CLayoutItem& root) {
    std::vector<CLayoutItem*> groups;
    CollectGroups(root, groups);
    return groups;
}

std::vector<int> PanesOf(const CLayoutItem& root) {
    std::vector<int> panes;
    CollectPanes(root, panes);
    return panes;
}

std::vector<std::pair<std::string, std::string>> SplitPredefinedLayouts(std::string_view text) {
    std::vector<std::string> parts;
    std::size_t start = 0;
    while (start <= text.size() && !text.empty()) {
        const std::size_t bar = text.find('|', start);
        const std::size_t end = bar == std::string_view::npos ? text.size() : bar;
        parts.emplace_back(text.substr(start, end - start));
        if (bar == std::string_view::npos) {
            break;
        }
        start = bar + 1;
    }
    std::vector<std::pair<std::string, std::string>> layouts;
    for (std::size_t i = 0; i + 1 < parts.size(); i += 2) {
        layouts.emplace_back(parts[i], parts[i + 1]);
    }
    return layouts;
}
