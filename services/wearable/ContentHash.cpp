#include "services/wearable/ContentHash.h"

#include <array>
#include <new>

#include <xxhash.h>

namespace quorl::wearable {

void ContentHash::Free::operator()(XXH3_state_s* state) const { XXH3_freeState(state); }

ContentHash::ContentHash() : state_(XXH3_createState()) {
    if (!state_ || XXH3_128bits_reset(state_.get()) != XXH_OK) {
        throw std::bad_alloc();
    }
}

void ContentHash::add(std::span<const std::byte> bytes) {
    XXH3_128bits_update(state_.get(), bytes.data(), bytes.size());
}

std::string ContentHash::text() const {
    constexpr std::string_view digits = "0123456789abcdef";
    XXH128_canonical_t canonical;
    XXH128_canonicalFromHash(&canonical, XXH3_128bits_digest(state_.get()));
    std::string text;
    for (const auto byte : canonical.digest) {
        text += digits[byte >> 4U];
        text += digits[byte & 0xFU];
    }
    return text;
}

std::string hashOf(std::string_view text) {
    ContentHash hash;
    hash.add(std::as_bytes(std::span(text)));
    return hash.text();
}

} // namespace quorl::wearable
