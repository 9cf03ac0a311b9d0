#pragma once

#include <cstddef>
#include <string>

namespace Port {

// The host's narrow string value type.
template <typename T>
class StringBase
{
public:
    StringBase() = default;
    StringBase(const T* text) : data(text ? text : std::basic_string<T>()) {}
    explicit StringBase(const std::basic_string<T>& text) : data(text) {}

    const T* c_str() const { return data.c_str(); }
    std::size_t size() const { return data.size(); }
    bool empty() const { return data.empty(); }

    bool operator==(const StringBase& other) const { return data == other.data; }
    bool operator!=(const StringBase& other) const { return data != other.data; }

private:
    std::basic_string<T> data;
};

} // namespace Port
