// A report as JSON.
#include "apps/oruinfo/writers.h"

#include "oru/version.h"

#include <nlohmann/json.hpp>

namespace OruInfo {

using Json = nlohmann::ordered_json;

namespace {

Json ToJson(Value const &value) {
    if (auto const *const none = std::get_if<Unavailable>(&value.content))
        return none->why.empty() ? Json() : Json{{"unavailable", none->why}};
    Json const bare = std::visit(
        [](auto const &content) -> Json {
            if constexpr (std::is_same_v<std::decay_t<decltype(content)>, Unavailable>)
                return Json();
            else
                return content;
        },
        value.content);
    return value.unit.empty() ? bare : Json{{"value", bare}, {"unit", value.unit}};
}

Json ToJson(Table const &table) {
    Json rows = Json::array();
    for (auto const &row : table.rows) {
        Json fields = Json::object();
        for (std::size_t i = 0; i < row.size(); ++i)
            fields[table.columns[i].id] = ToJson(row[i]);
        rows.push_back(fields);
    }
    return rows;
}

Json ToJson(Group const &group);

Json ToJson(std::vector<Group> const &groups) {
    Json list = Json::array();
    for (Group const &group : groups)
        list.push_back(ToJson(group));
    return list;
}

Json ToJson(Group const &group) {
    Json fields = Json::object();
    for (Field const &field : group.fields)
        fields[field.id] =
            std::visit([](auto const &content) { return ToJson(content); }, field.content);
    if (!group.failure.empty())
        fields["failure"] = group.failure;
    return fields;
}

} // namespace

std::string JsonOf(Report const &report) {
    Json whole = {{"oruinfo", {{"schema", 1}, {"version", ORU::Version()}}}};
    for (Section const &section : report)
        whole[section.id] = ToJson(section.group);
    // Drivers' texts may be of any encoding.
    return whole.dump(1, ' ', false, Json::error_handler_t::replace) + "\n";
}

} // namespace OruInfo
