#pragma once

#include <memory>
#include <string>
#include <string_view>

struct XXH3_state_s;

namespace quorl::wearable {

/// Tells whether a text is as it was written: XXH3 with 64 bits.
class Checksum {
  public:
    Checksum();

    void add(std::string_view text);

    /// Of everything that was added, in hexadecimal digits.
    [[nodiscard]] std::string text() const;

  private:
    struct Free {
        void operator()(XXH3_state_s* state) const;
    };

    std::unique_ptr<XXH3_state_s, Free> state_;
};

} // namespace quorl::wearable
