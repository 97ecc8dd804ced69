// What changed between two reports.
#include "apps/oruinfo/reportdiff.h"

#include "apps/common/failure.h"
#include "apps/common/file.h"
#include "apps/common/unicode.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <set>

namespace OruInfo {

using Json = nlohmann::ordered_json;

namespace {

constexpr int kSchema = 1;

Json Parsed(std::string const &text) {
    try {
        return Json::parse(text);
    } catch (Json::exception const &) {
        throw App::Failure("is not JSON");
    }
}

Json ReadReport(std::filesystem::path const &path) {
    try {
        Json report = Parsed(App::ReadText(path));
        if (!report.is_object() || !report.contains("oruinfo") || !report["oruinfo"].is_object())
            throw App::Failure("is no report of oruinfo");
        if (report["oruinfo"].value("schema", Json()) != kSchema)
            throw App::Failure("is a report of another version of oruinfo, which this one does not "
                               "read");
        return report;
    } catch (App::Failure const &failure) {
        throw App::Failure(App::ToText(path) + ": " + failure.what());
    }
}

/// A value as it is shown: a text as it is, a number with its unit.
std::string Shown(Json const &value) {
    if (value.is_string())
        return value.get<std::string>();
    if (value.is_object() && value.contains("value") && value.contains("unit"))
        return Shown(value["value"]) + " " + Shown(value["unit"]);
    return value.is_null() ? "nothing" : value.dump();
}

bool IsTree(Json const &value) {
    return value.is_object() && !value.contains("unit");
}

bool IsTable(Json const &value) {
    return value.is_array() && !value.empty() && IsTree(value.front());
}

/// What names a row: its first field.
std::string NameOf(Json const &row, std::size_t index) {
    return row.is_object() && !row.empty() ? Shown(row.front()) : std::to_string(index);
}

/// The rows by name, as an object; by their places where names are not unique.
Json ByName(Json const &rows) {
    Json named = Json::object();
    for (std::size_t i = 0; i < rows.size(); ++i)
        named[NameOf(rows[i], i)] = rows[i];
    if (named.size() == rows.size())
        return named;
    named = Json::object();
    for (std::size_t i = 0; i < rows.size(); ++i)
        named[std::to_string(i)] = rows[i];
    return named;
}

class Differ {
public:
    std::vector<std::string> lines;

    void compare(std::string const &path, Json const &before, Json const &after) {
        if (IsTree(before) && IsTree(after))
            compareFields(path, before, after, ".", "");
        else if (before.is_array() && after.is_array() && (IsTable(before) || IsTable(after)))
            compareFields(path, ByName(before), ByName(after), "[", "]");
        else if (before.is_array() && after.is_array())
            compareLists(path, before, after);
        else if (before != after)
            lines.push_back(path + ": " + Shown(before) + " -> " + Shown(after));
    }

private:
    void compareFields(std::string const &path, Json const &before, Json const &after,
                       std::string const &open, std::string const &close) {
        auto const join = [&](std::string const &name) {
            return path.empty() ? name : path + open + name + close;
        };
        for (auto const &[name, value] : before.items()) {
            if (auto const found = after.find(name); found != after.end())
                compare(join(name), value, *found);
            else
                lines.push_back(join(name) + ": only in the first");
        }
        for (auto const &[name, value] : after.items())
            if (!before.contains(name))
                lines.push_back(join(name) + ": only in the second");
    }

    void compareLists(std::string const &path, Json const &before, Json const &after) {
        std::set<Json> const first(before.begin(), before.end()),
            second(after.begin(), after.end());
        for (Json const &value : first)
            if (!second.count(value))
                lines.push_back(path + ": - " + Shown(value));
        for (Json const &value : second)
            if (!first.count(value))
                lines.push_back(path + ": + " + Shown(value));
        if (first == second && before != after)
            lines.push_back(path + ": the same in another order");
    }
};

} // namespace

std::vector<std::string> DiffReports(std::filesystem::path const &before,
                                     std::filesystem::path const &after) {
    Differ differ;
    differ.compare("", ReadReport(before), ReadReport(after));
    return differ.lines;
}

} // namespace OruInfo
