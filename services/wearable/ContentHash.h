#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

struct XXH3_state_s;

namespace quorl::wearable {

/// The hash of some contents.
struct Digest {
    std::uint64_t high = 0;
    std::uint64_t low = 0;

    bool operator==(const Digest&) const = default;
};

/// 32 hexadecimal digits.
[[nodiscard]] std::string toText(const Digest& digest);

/// The other way round; nothing where the text is another one.
[[nodiscard]] std::optional<Digest> digestIn(std::string_view text);

/// Tells contents of files apart: XXH3 with 128 bits. Does not withstand somebody who looks for two
/// contents with the same hash.
class ContentHash {
  public:
    ContentHash();

    void add(std::span<const std::byte> bytes);

    /// Of everything that was added.
    [[nodiscard]] Digest digest() const;

  private:
    struct Free {
        void operator()(XXH3_state_s* state) const;
    };

    std::unique_ptr<XXH3_state_s, Free> state_;
};

[[nodiscard]] Digest hashOf(std::string_view text);

} // namespace quorl::wearable
