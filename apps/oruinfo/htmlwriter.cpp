// A report as a page.
#include "apps/oruinfo/valuetext.h"
#include "apps/oruinfo/writers.h"

#include "oru/version.h"

namespace OruInfo {

namespace {

constexpr char kStyle[] = R"(
:root { color-scheme: light dark; --line: #8884; --soft: #8881; --bad: #c22; --good: #171 }
@media (prefers-color-scheme: dark) { :root { --bad: #f77; --good: #8d8 } }
body { font: 15px/1.5 system-ui, "Segoe UI", sans-serif; max-width: 76rem; margin: 0 auto;
  padding: 1.5rem }
h1 { font-size: 1.6rem; margin: 0 } h2 { font-size: 1.25rem; margin: 2.2rem 0 .6rem;
  border-bottom: 2px solid var(--line); padding-bottom: .2rem }
h3 { font-size: 1rem; margin: 1.2rem 0 .4rem }
nav { margin: .8rem 0; display: flex; flex-wrap: wrap; gap: .2rem 1.2rem }
.table { overflow-x: auto }
table { border-collapse: collapse; font-variant-numeric: tabular-nums }
th, td { text-align: left; vertical-align: top; padding: .15rem .8rem .15rem .3rem;
  border-bottom: 1px solid var(--line) }
thead th { background: var(--soft) } tbody th { font-weight: 500 }
tr:hover td, tr:hover th { background: var(--soft) }
.number { text-align: right } .yes { color: var(--good) } .no { opacity: .6 }
.failure { border-left: 4px solid var(--bad); padding: .4rem .8rem; background: var(--soft) }
.names { columns: 18rem; margin: .2rem 0; padding-left: 1.1rem; font-size: .9rem }
.group { border-left: 3px solid var(--line); padding-left: 1rem; margin: 1rem 0 }
summary { cursor: pointer; font-weight: 600; margin: 1rem 0 .4rem }
@media print { body { font-size: 9pt; max-width: none; padding: 0 } nav, details { display: none }
  h2 { break-after: avoid } tr { break-inside: avoid } thead { display: table-header-group }
  .table { overflow: visible } }
)";

std::string Escaped(std::string const &text) {
    std::string escaped;
    for (char const c : text) {
        switch (c) {
        case '&':
            escaped += "&amp;";
            break;
        case '<':
            escaped += "&lt;";
            break;
        case '>':
            escaped += "&gt;";
            break;
        case '"':
            escaped += "&quot;";
            break;
        default:
            escaped += c;
        }
    }
    return escaped;
}

std::string Element(std::string const &name, std::string const &text) {
    return "<" + name + ">" + Escaped(text) + "</" + name.substr(0, name.find(' ')) + ">\n";
}

std::string ListOf(Names const &names) {
    std::string html = "<ul class=\"names\">\n";
    for (std::string const &name : names)
        html += Element("li", name);
    return html + "</ul>\n";
}

std::string Cell(Value const &value) {
    bool const *const flag = std::get_if<bool>(&value.content);
    std::string const kind = IsNumber(value) ? "number" : !flag ? "" : *flag ? "yes" : "no";
    return Element(kind.empty() ? "td" : "td class=\"" + kind + "\"", ShownInTable(value));
}

std::string Html(Value const &value) {
    Names const *const names = NamesOf(value);
    return names ? ListOf(*names) : Element("p", Shown(value));
}

std::string Html(Table const &table) {
    if (table.rows.empty())
        return "<p>none</p>\n";
    std::string html = "<div class=\"table\"><table>\n<thead><tr>\n";
    std::vector<std::size_t> const columns = ShownColumns(table);
    for (std::size_t const c : columns)
        html += Element("th", table.columns[c].title);
    html += "</tr></thead>\n<tbody>\n";
    for (auto const &row : table.rows) {
        html += "<tr>\n";
        for (std::size_t const c : columns)
            html += Cell(row[c]);
        html += "</tr>\n";
    }
    return html + "</tbody></table></div>\n";
}

std::string Html(Group const &group);

std::string Html(std::vector<Group> const &groups) {
    std::string html;
    for (Group const &group : groups)
        html += "<div class=\"group\">\n" + Element("h3", group.title) + Html(group) + "</div>\n";
    return html;
}

bool IsNothingToTell(Field const &field) {
    auto const *const value = std::get_if<Value>(&field.content);
    return value && IsNothing(*value);
}

/// Whether a field is a line of the table that its neighbours are in.
bool IsLine(Field const &field) {
    auto const *const value = std::get_if<Value>(&field.content);
    return value && !field.isDetail && (!NamesOf(*value) || NamesOf(*value)->size() < 6);
}

std::string Block(Field const &field) {
    std::string const content =
        std::visit([](auto const &value) { return Html(value); }, field.content);
    std::size_t const count = Count(field);
    std::string const title =
        field.title + (count > 5 ? " (" + std::to_string(count) + ")" : std::string());
    if (field.isDetail)
        return "<details>" + Element("summary", title) + content + "</details>\n";
    return Element("h3", title) + content;
}

std::string Html(Group const &group) {
    std::string html;
    bool inTable = false;
    for (Field const &field : group.fields) {
        if (IsNothingToTell(field))
            continue;
        if (IsLine(field) != inTable)
            html += inTable ? "</table></div>\n" : "<div class=\"table\"><table>\n";
        inTable = IsLine(field);
        html += inTable ? "<tr>" + Element("th", field.title) +
                              Element("td", Shown(std::get<Value>(field.content))) + "</tr>\n"
                        : Block(field);
    }
    if (inTable)
        html += "</table></div>\n";
    if (!group.failure.empty())
        html += Element("p class=\"failure\"", group.failure);
    return html;
}

} // namespace

std::string HtmlOf(Report const &report) {
    std::string const title =
        std::string("What this machine offers, as ORU ") + ORU::Version() + " sees it";
    std::string html = "<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
                       "<meta name=\"viewport\" content=\"width=device-width\">\n" +
                       Element("title", title) + "<style>" + kStyle +
                       "</style>\n</head>\n<body>\n" + Element("h1", title) + "<nav>\n";
    for (Section const &section : report)
        html += Element("a href=\"#" + section.id + "\"", section.group.title);
    html += "</nav>\n";
    for (Section const &section : report)
        html += "<section id=\"" + section.id + "\">\n" + Element("h2", section.group.title) +
                Html(section.group) + "</section>\n";
    return html + "</body>\n</html>\n";
}

} // namespace OruInfo
