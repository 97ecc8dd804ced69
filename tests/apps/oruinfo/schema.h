// Holds values against a JSON schema, and the schema against the values.
#pragma once

#include <nlohmann/json.hpp>

#include <set>
#include <string>
#include <vector>

namespace apps_test {

using Json = nlohmann::ordered_json;

/// A schema of the few keywords that docs/oruinfo.schema.json has.
class Schema {
public:
    explicit Schema(Json schema) : root_(std::move(schema)) { collect(root_, ""); }

    /// Where a value is not as the schema says.
    std::vector<std::string> problems(Json const &value) {
        return check(root_, "", value, "", seen_);
    }

    /// The properties that the schema names and no value had so far, by their places in the schema.
    std::set<std::string> unseen() const {
        std::set<std::string> names;
        std::set_difference(named_.begin(), named_.end(), seen_.begin(), seen_.end(),
                            std::inserter(names, names.end()));
        return names;
    }

private:
    using Problems = std::vector<std::string>;
    using Places = std::set<std::string>;

    /// @param where the place of `schema`
    /// @param at the place of `value`
    Problems check(Json const &schema, std::string const &where, Json const &value,
                   std::string const &at, Places &seen) const;
    Problems checkFields(Json const &schema, std::string const &where, Json const &value,
                         std::string const &at, Places &seen) const;
    Problems checkAny(Json const &schemas, std::string const &where, Json const &value,
                      std::string const &at, Places &seen) const;
    void collect(Json const &schema, std::string const &where);

    Json root_;
    Places named_, seen_;
};

} // namespace apps_test
