#include "services/wearable/Checksum.h"

#include <array>
#include <charconv>
#include <new>

#include <xxhash.h>

namespace quorl::wearable {

void Checksum::Free::operator()(XXH3_state_s* state) const { XXH3_freeState(state); }

Checksum::Checksum() : state_(XXH3_createState()) {
    if (!state_ || XXH3_64bits_reset(state_.get()) != XXH_OK) {
        throw std::bad_alloc();
    }
}

void Checksum::add(std::string_view text) {
    XXH3_64bits_update(state_.get(), text.data(), text.size());
}

std::string Checksum::text() const {
    constexpr int hexadecimal = 16;
    std::array<char, hexadecimal> digits{};
    const auto end = std::to_chars(digits.data(), digits.data() + digits.size(),
                                   XXH3_64bits_digest(state_.get()), hexadecimal);
    return {digits.data(), end.ptr};
}

} // namespace quorl::wearable
