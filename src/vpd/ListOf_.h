#pragma once

#include <cstddef>
#include <map>
#include <string>

namespace Quorvex::VPD {

// Model objects kept by value under their key text (`__StringValue()`), in
// byte order of the keys. An element whose key is present already is merged
// into the one there with `+=`, so what was inserted first wins wherever the
// element's merge keeps its own content.
template <typename T> class ListOf_ {
public:
    class Error_ElementNotFound {};

    using iterator = typename std::map<std::string, T>::iterator;
    using const_iterator = typename std::map<std::string, T>::const_iterator;

    ListOf_() = default;
    ListOf_(ListOf_ const& other) = default;
    ListOf_(ListOf_&& other) noexcept = default;
    // Copies before it lets the old content go: other may live inside it.
    ListOf_& operator=(ListOf_ const& other) {
        std::map<std::string, T> copy(other._Elements);
        _Elements.swap(copy);
        return *this;
    }
    ListOf_& operator=(ListOf_&& other) noexcept = default;
    ~ListOf_() = default;

    void insert(T const& element) {
        auto const placed = _Elements.try_emplace(element.__StringValue(), element);
        if (!placed.second) {
            placed.first->second += element;
        }
    }

    bool contains(std::string const& key) const { return _Elements.count(key) != 0; }

    // Throws Error_ElementNotFound when no element has that key.
    T const& find(std::string const& key) const {
        auto const hit = _Elements.find(key);
        if (hit == _Elements.end()) {
            throw Error_ElementNotFound();
        }
        return hit->second;
    }

    // The element under key, a default one being added there when absent.
    T& find_orCreate(std::string const& key) { return _Elements[key]; }

    // Merging a list into itself, or an empty list, changes nothing.
    ListOf_& operator+=(ListOf_ const& other) {
        if (&other == this || other._Elements.empty()) {
            return *this;
        }
        for (auto const& entry : other._Elements) {
            insert(entry.second);
        }
        return *this;
    }

    void assign(ListOf_ const& other) { *this = other; }

    std::size_t size() const { return _Elements.size(); }
    bool empty() const { return _Elements.empty(); }

    iterator begin() { return _Elements.begin(); }
    iterator end() { return _Elements.end(); }
    const_iterator begin() const { return _Elements.begin(); }
    const_iterator end() const { return _Elements.end(); }

private:
    std::map<std::string, T> _Elements;
};

} // namespace Quorvex::VPD
