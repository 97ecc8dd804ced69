// Holds values against a JSON schema, and the schema against the values.
#include "tests/apps/oruinfo/schema.h"

#include <algorithm>
#include <iterator>

namespace apps_test {

namespace {

bool IsOfType(Json const &value, std::string const &type) {
    return type == "integer" ? value.is_number_integer() : value.type_name() == type;
}

void Append(std::vector<std::string> &to, std::vector<std::string> const &from) {
    to.insert(to.end(), from.begin(), from.end());
}

} // namespace

Schema::Problems Schema::check(Json const &schema, std::string const &where, Json const &value,
                               std::string const &at, Places &seen) const {
    Problems problems;
    for (auto const &[keyword, rule] : schema.items()) {
        bool isKept = true;
        if (keyword == "$ref") {
            std::string const target = rule.get<std::string>().substr(1);
            Append(problems, check(root_[Json::json_pointer(target)], target, value, at, seen));
        } else if (keyword == "anyOf") {
            Append(problems, checkAny(rule, where + "/anyOf/", value, at, seen));
        } else if (keyword == "properties") {
            Append(problems, checkFields(rule, where + "/properties/", value, at, seen));
        } else if (keyword == "items") {
            for (Json const &item : value)
                Append(problems, check(rule, where + "/items", item, at + "[]", seen));
        } else if (keyword == "type") {
            Json const types = rule.is_array() ? rule : Json::array({rule});
            isKept = std::any_of(types.begin(), types.end(), [&](Json const &type) {
                return IsOfType(value, type.get<std::string>());
            });
        } else if (keyword == "required") {
            isKept = std::all_of(rule.begin(), rule.end(), [&](Json const &name) {
                return value.contains(name.get<std::string>());
            });
        } else if (keyword == "enum") {
            isKept = std::find(rule.begin(), rule.end(), value) != rule.end();
        } else if (keyword == "const") {
            isKept = rule == value;
        } else if (keyword == "additionalProperties") {
            isKept = rule == false && schema.contains("properties"); // which looks after it
        } else {
            isKept = keyword[0] == '$' || keyword == "title" || keyword == "description";
        }
        if (!isKept)
            problems.push_back(at + ": " + value.dump() + " is against " + keyword + " of " +
                               where);
    }
    return problems;
}

Schema::Problems Schema::checkFields(Json const &schema, std::string const &where,
                                     Json const &value, std::string const &at, Places &seen) const {
    Problems problems;
    for (auto const &[name, field] : value.items()) {
        if (!value.is_object() || !schema.contains(name)) {
            problems.push_back(at + "." + name + " is not named in " + where);
            continue;
        }
        seen.insert(where + name);
        Append(problems, check(schema[name], where + name, field, at + "." + name, seen));
    }
    return problems;
}

Schema::Problems Schema::checkAny(Json const &schemas, std::string const &where, Json const &value,
                                  std::string const &at, Places &seen) const {
    Problems problems;
    for (std::size_t i = 0; i < schemas.size(); ++i) {
        Places met;
        Problems const mismatch = check(schemas[i], where + std::to_string(i), value, at, met);
        seen.insert(met.begin(), met.end());
        if (mismatch.empty())
            return {};
        Append(problems, mismatch);
    }
    return problems;
}

void Schema::collect(Json const &schema, std::string const &where) {
    for (auto const &[name, part] : schema.items()) {
        if (name == "properties" && schema.is_object())
            for (auto const &[field, rule] : part.items())
                named_.insert(where + "/properties/" + field);
        if (part.is_structured())
            collect(part, where + "/" + name);
    }
}

} // namespace apps_test
