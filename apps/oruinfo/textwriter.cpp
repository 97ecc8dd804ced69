// A report as text.
#include "apps/oruinfo/valuetext.h"
#include "apps/oruinfo/writers.h"

#include "oru/version.h"

#include <algorithm>
#include <map>

namespace OruInfo {

namespace {

constexpr std::size_t kColumns = 100;
/// More names than this stand in a paragraph of their own.
constexpr std::size_t kNamesBesideTitle = 9;

/// How wide a text is on a terminal: the characters of UTF-8, not its bytes.
std::size_t Width(std::string const &text) {
    return static_cast<std::size_t>(std::count_if(text.begin(), text.end(), [](char c) {
        return (static_cast<unsigned char>(c) & 0xC0u) != 0x80u;
    }));
}

std::string Padding(std::size_t width, std::string const &text) {
    std::size_t const used = Width(text);
    return std::string(width > used ? width - used : 0, ' ');
}

/// The names in lines of at most `width`, where a single name fits.
std::vector<std::string> Wrapped(Names const &names, char const *separator, std::size_t width) {
    std::vector<std::string> lines(1);
    for (std::string const &name : names) {
        if (!lines.back().empty()) {
            lines.back() += separator;
            if (Width(lines.back()) + Width(name) > width)
                lines.emplace_back();
        }
        lines.back() += name;
    }
    return lines;
}

bool IsParagraph(Value const &value) {
    Names const *const names = NamesOf(value);
    return names && names->size() > kNamesBesideTitle;
}

class Writer {
public:
    std::string text;

    void write(Group const &group, std::size_t indent) {
        std::size_t const width = titleWidth(group);
        for (Field const &field : group.fields)
            write(field, indent, width);
    }

    void line(std::size_t indent, std::string const &content) {
        std::string const whole = std::string(indent, ' ') + content;
        text += whole.substr(0, whole.find_last_not_of(' ') + 1) + "\n";
    }

    /// An empty line, unless a heading stands above.
    void gap() {
        bool const isBelowHeading = text.size() > 1 && text[text.size() - 2] == '=';
        if (!isBelowHeading)
            line(0, "");
    }

private:
    /// Of the titles that stand before a value in the same line.
    static std::size_t titleWidth(Group const &group) {
        std::size_t width = 0;
        for (Field const &field : group.fields)
            if (auto const *const value = std::get_if<Value>(&field.content))
                if (!IsParagraph(*value))
                    width = std::max(width, Width(field.title));
        return width;
    }

    void write(Field const &field, std::size_t indent, std::size_t width) {
        if (field.isDetail) {
            gap();
            line(indent, field.title + ": " + std::to_string(Count(field)) +
                             ", which --json and --html list");
        } else if (auto const *const value = std::get_if<Value>(&field.content)) {
            write(field.title, *value, indent, width);
        } else if (auto const *const table = std::get_if<Table>(&field.content)) {
            gap();
            write(field.title, *table, indent);
        } else {
            for (Group const &group : std::get<std::vector<Group>>(field.content)) {
                gap();
                line(indent, group.title);
                write(group, indent + 2);
                if (!group.failure.empty())
                    line(indent + 2, "FAILED: " + group.failure);
            }
        }
    }

    void write(std::string const &title, Value const &value, std::size_t indent,
               std::size_t width) {
        if (IsNothing(value))
            return;
        if (IsParagraph(value)) {
            Names const &names = *NamesOf(value);
            line(indent, title + ": " + std::to_string(names.size()));
            for (std::string const &words : Wrapped(names, " ", kColumns - indent - 2))
                line(indent + 2, words);
            return;
        }
        Names const *const names = NamesOf(value);
        std::string before = title + Padding(width, title) + "  ";
        for (std::string const &words : names ? Wrapped(*names, ", ", kColumns - indent - width - 2)
                                              : std::vector<std::string>{Shown(value)}) {
            line(indent, before + words);
            before.assign(width + 2, ' ');
        }
    }

    void write(std::string const &title, Table const &table, std::size_t indent) {
        if (table.rows.empty()) {
            line(indent, title + ": none");
            return;
        }
        line(indent, title);
        std::vector<std::string> lines(table.rows.size() + 1);
        for (std::size_t const c : ShownColumns(table)) {
            std::vector<std::string> cells{table.columns[c].title};
            for (auto const &row : table.rows)
                cells.push_back(ShownInTable(row[c]));
            std::size_t width = 0;
            for (std::string const &cell : cells)
                width = std::max(width, Width(cell));
            bool const toRight = IsNumber(table.rows[0][c]);
            for (std::size_t i = 0; i < cells.size(); ++i) {
                std::string const padding = Padding(width, cells[i]);
                lines[i] += (toRight ? padding + cells[i] : cells[i] + padding) + "  ";
            }
        }
        for (std::string const &content : lines)
            line(indent + 2, content);
    }
};

} // namespace

std::string TextOf(Report const &report) {
    Writer writer;
    std::map<std::string, std::string> failedAlready; // the section, by what failed
    writer.line(0, std::string("What this machine offers, as ORU ") + ORU::Version() + " sees it");
    for (Section const &section : report) {
        writer.gap();
        writer.line(0, section.group.title + "  [" + section.id + "]");
        writer.line(0, std::string(Width(section.group.title), '='));
        writer.write(section.group, 2);
        if (std::string const &failure = section.group.failure; !failure.empty()) {
            auto const [first, isNew] = failedAlready.emplace(failure, section.id);
            writer.line(2, "FAILED: " + (isNew ? failure : "as [" + first->second + "]"));
        }
    }
    return writer.text;
}

} // namespace OruInfo
