#pragma once

#include <functional>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <vector>

/// An immutable ordered list, shared by whoever holds it. Null counts as empty.
template <class T>
using NSArray = std::shared_ptr<const std::vector<std::shared_ptr<T>>>;

/// The elements of a list; none for a null list. Valid while the caller holds the list.
template <class T>
[[nodiscard]] std::span<const std::shared_ptr<T>>
elements(const std::shared_ptr<const std::vector<std::shared_ptr<T>>>& list) {
    return list ? std::span<const std::shared_ptr<T>>(*list)
                : std::span<const std::shared_ptr<T>>();
}

/// An immutable table from text to object.
template <class T>
using NSDictionary = std::shared_ptr<const std::map<std::string, std::shared_ptr<T>, std::less<>>>;
