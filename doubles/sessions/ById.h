#pragma once

#include <algorithm>
#include <memory>
#include <vector>

namespace quorl {

/// Takes the first object with an id out of `objects`; null where none has it.
template <class T, class Id>
[[nodiscard]] std::shared_ptr<T> takeById(std::vector<std::shared_ptr<T>>& objects, const Id& id) {
    const auto found = std::find_if(objects.begin(), objects.end(),
                                    [&id](const auto& object) { return object->id() == id; });
    if (found == objects.end()) {
        return nullptr;
    }
    auto object = *found;
    objects.erase(found);
    return object;
}

} // namespace quorl
