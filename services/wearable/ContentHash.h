#pragma once

#include <cstddef>
#include <memory>
#include <span>
#include <string>
#include <string_view>

struct XXH3_state_s;

namespace quorl::wearable {

/// Tells contents of files apart: XXH3 with 128 bits. Does not withstand somebody who looks for two
/// contents with the same hash.
class ContentHash {
  public:
    ContentHash();

    void add(std::span<const std::byte> bytes);

    /// Of everything that was added, in hexadecimal digits.
    [[nodiscard]] std::string text() const;

  private:
    struct Free {
        void operator()(XXH3_state_s* state) const;
    };

    std::unique_ptr<XXH3_state_s, Free> state_;
};

[[nodiscard]] std::string hashOf(std::string_view text);

} // namespace quorl::wearable
