// The two-step queries of OpenCL: how much there is, then what it is.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

#include <cstddef>
#include <cstring>
#include <string>
#include <vector>

namespace ORU::OCL {

/// Reads the list that `query(bytes, value, bytesReturned)` answers.
template<class T, class Query>
std::vector<T> QueryList(Query const &query) {
    std::size_t bytes = 0;
    query(std::size_t(0), nullptr, &bytes);
    std::vector<T> list(bytes / sizeof(T));
    query(list.size() * sizeof(T), list.data(), nullptr);
    return list;
}

/// Reads the characters that `query(bytes, value, bytesReturned)` answers, terminator included.
template<class Query>
std::string QueryCharacters(Query const &query) {
    std::size_t bytes = 0;
    query(std::size_t(0), nullptr, &bytes);
    std::string text(bytes, '\0');
    query(bytes, text.data(), nullptr);
    return text;
}

/// The same up to the first terminator.
template<class Query>
std::string QueryText(Query const &query) {
    std::string text = QueryCharacters(query);
    text.resize(std::strlen(text.c_str()));
    return text;
}

/// Reads the handles that `query(count, handles, countReturned)` answers.
template<class T, class Query>
std::vector<T> QueryHandles(Query const &query) {
    cl_uint count = 0;
    query(cl_uint(0), nullptr, &count);
    std::vector<T> handles(count);
    if (count > 0)
        query(count, handles.data(), nullptr);
    return handles;
}

} // namespace ORU::OCL
