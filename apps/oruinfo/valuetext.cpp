// Values as people read them.
#include "apps/oruinfo/valuetext.h"

#include <algorithm>
#include <cstdio>

namespace OruInfo {

namespace {

/// A size in the largest unit that makes it 1 or more; empty below the first unit.
std::string InLargeUnit(std::uint64_t bytes) {
    double size = static_cast<double>(bytes);
    char const *unit = nullptr;
    for (char const *const larger : {"KiB", "MiB", "GiB", "TiB"}) {
        if (size < 1024)
            break;
        size /= 1024;
        unit = larger;
    }
    if (!unit)
        return std::string();
    char text[64];
    std::snprintf(text, sizeof text, "%.4g %s", size, unit);
    return text;
}

std::string Joined(Names const &names, char const *separator) {
    std::string text;
    for (std::string const &name : names)
        text += (text.empty() ? "" : separator) + name;
    return text.empty() ? "none" : text;
}

/// The numbers of a set, with runs of three or more shortened: "1-4, 7".
Names Runs(Numbers const &numbers) {
    Names runs;
    for (std::size_t i = 0; i < numbers.size();) {
        std::size_t end = i + 1;
        while (end < numbers.size() && numbers[end] == numbers[end - 1] + 1)
            ++end;
        bool const isRun = end - i > 2;
        runs.push_back(std::to_string(numbers[i]) +
                       (isRun ? "-" + std::to_string(numbers[end - 1]) : ""));
        i = isRun ? end : i + 1;
    }
    return runs;
}

Names Texts(Numbers const &numbers) {
    Names texts;
    for (std::uint64_t const number : numbers)
        texts.push_back(std::to_string(number));
    return texts;
}

struct Show {
    std::string const &unit;
    bool exactly;

    template<class Number>
    std::string withUnit(Number number) const {
        std::string text = std::to_string(number);
        if (unit.empty())
            return text;
        bool const isSingular = number == 1 && unit.back() == 's';
        return text + " " + unit.substr(0, unit.size() - (isSingular ? 1 : 0));
    }

    std::string operator()(Unavailable const &none) const {
        return none.why.empty() ? "-" : "not told: " + none.why;
    }
    std::string operator()(bool value) const { return value ? "yes" : "no"; }
    std::string operator()(std::int64_t value) const { return withUnit(value); }
    std::string operator()(std::uint64_t value) const {
        std::string const exact = withUnit(value);
        std::string const large = unit == "bytes" ? InLargeUnit(value) : "";
        return large.empty() ? exact : exactly ? large + " (" + exact + ")" : large;
    }
    std::string operator()(std::string const &value) const { return value.empty() ? "-" : value; }
    std::string operator()(Names const &value) const { return Joined(value, ", "); }
    std::string operator()(Numbers const &value) const {
        return unit.empty() ? Joined(Runs(value), ", ") : Joined(Texts(value), " x ") + " " + unit;
    }
};

} // namespace

std::string Shown(Value const &value) {
    return std::visit(Show{value.unit, true}, value.content);
}

std::string ShownInTable(Value const &value) {
    return std::visit(Show{value.unit, false}, value.content);
}

bool IsNothing(Value const &value) {
    auto const *const none = std::get_if<Unavailable>(&value.content);
    return none && none->why.empty();
}

bool IsNumber(Value const &value) {
    return std::holds_alternative<std::int64_t>(value.content) ||
           std::holds_alternative<std::uint64_t>(value.content);
}

Names const *NamesOf(Value const &value) {
    auto const *const names = std::get_if<Names>(&value.content);
    return names && !names->empty() ? names : nullptr;
}

std::vector<std::size_t> ShownColumns(Table const &table) {
    std::vector<std::size_t> shown;
    for (std::size_t c = 0; c < table.columns.size(); ++c) {
        bool const tells = std::any_of(table.rows.begin(), table.rows.end(),
                                       [c](auto const &row) { return !IsNothing(row[c]); });
        if (tells && !table.columns[c].isDetail)
            shown.push_back(c);
    }
    return shown;
}

std::size_t Count(Field const &field) {
    if (auto const *const table = std::get_if<Table>(&field.content))
        return table->rows.size();
    auto const *const value = std::get_if<Value>(&field.content);
    Names const *const names = value ? NamesOf(*value) : nullptr;
    return names ? names->size() : 0;
}

} // namespace OruInfo
