// A report about the machine: a tree of named values, the same for every form that it is written
// in.
#pragma once

#include <cstdint>
#include <string>
#include <type_traits>
#include <utility>
#include <variant>
#include <vector>

namespace OruInfo {

/// Stands for a value that cannot be told; empty where there is nothing to tell.
struct Unavailable {
    std::string why;
};

using Names = std::vector<std::string>;

/// With a unit the sides of something, without one a set.
using Numbers = std::vector<std::uint64_t>;

/// What a driver says, in its own type.
struct Value {
    using Content =
        std::variant<Unavailable, bool, std::int64_t, std::uint64_t, std::string, Names, Numbers>;

    template<class T, class = std::enable_if_t<!std::is_same_v<std::decay_t<T>, Value>>>
    Value(T &&from, std::string unitOfNumber = std::string())
        : content(std::forward<T>(from)), unit(std::move(unitOfNumber)) {}

    Content content;
    std::string unit; ///< of a number, in the plural: "bytes"; empty for a bare count
};

/// Ids are what machines read, titles what people read.
struct Column {
    std::string id;
    std::string title;
    bool isDetail = false; ///< for programs, not for people
};

struct Table {
    std::vector<Column> columns;
    std::vector<std::vector<Value>> rows; ///< a value for each column
};

struct Field;

/// Named values that belong together.
struct Group {
    std::string title;
    std::vector<Field> fields;
    std::string failure; ///< what kept the rest of the fields from being gathered, or empty

    void add(std::string const &id, std::string const &title, Value const &value);
    void add(std::string const &id, std::string const &title, Table const &table);
    void add(std::string const &id, std::string const &title, std::vector<Group> const &groups);

    /// The same for what is too long to be read: the text only counts it.
    template<class Content>
    void addDetail(std::string const &id, std::string const &title, Content const &content);
};

struct Field {
    std::string id;
    std::string title;
    std::variant<Value, Table, std::vector<Group>> content;
    bool isDetail = false;
};

inline void Group::add(std::string const &id, std::string const &fieldTitle, Value const &value) {
    fields.push_back({id, fieldTitle, value});
}

inline void Group::add(std::string const &id, std::string const &fieldTitle, Table const &table) {
    fields.push_back({id, fieldTitle, table});
}

inline void Group::add(std::string const &id, std::string const &fieldTitle,
                       std::vector<Group> const &groups) {
    fields.push_back({id, fieldTitle, groups});
}

template<class Content>
void Group::addDetail(std::string const &id, std::string const &fieldTitle,
                      Content const &content) {
    add(id, fieldTitle, content);
    fields.back().isDetail = true;
}

struct Section {
    std::string id;
    Group group;
};

using Report = std::vector<Section>;

} // namespace OruInfo
