#include "services/wearable/ContentHash.h"

#include <array>
#include <charconv>
#include <new>

#include <xxhash.h>

namespace quorl::wearable {

namespace {

constexpr int hexadecimal = 16;
constexpr std::size_t digitsOfHalf = 16;

void append(std::uint64_t half, std::string& text) {
    std::array<char, digitsOfHalf> digits{};
    const auto end =
        std::to_chars(digits.data(), digits.data() + digits.size(), half, hexadecimal).ptr;
    const auto size = static_cast<std::size_t>(end - digits.data());
    text.append(digitsOfHalf - size, '0').append(digits.data(), size);
}

/// Whether all of it is a number.
bool read(std::string_view digits, std::uint64_t& half) {
    const auto* const end = digits.data() + digits.size();
    const auto read = std::from_chars(digits.data(), end, half, hexadecimal);
    return read.ec == std::errc() && read.ptr == end;
}

Digest digestOf(const XXH128_hash_t& hash) { return {hash.high64, hash.low64}; }

} // namespace

std::string toText(const Digest& digest) {
    std::string text;
    text.reserve(2 * digitsOfHalf);
    append(digest.high, text);
    append(digest.low, text);
    return text;
}

std::optional<Digest> digestIn(std::string_view text) {
    Digest digest;
    const bool isDigest = text.size() == 2 * digitsOfHalf &&
                          read(text.substr(0, digitsOfHalf), digest.high) &&
                          read(text.substr(digitsOfHalf), digest.low);
    return isDigest ? std::optional(digest) : std::nullopt;
}

void ContentHash::Free::operator()(XXH3_state_s* state) const { XXH3_freeState(state); }

ContentHash::ContentHash() : state_(XXH3_createState()) {
    if (!state_ || XXH3_128bits_reset(state_.get()) != XXH_OK) {
        throw std::bad_alloc();
    }
}

void ContentHash::add(std::span<const std::byte> bytes) {
    XXH3_128bits_update(state_.get(), bytes.data(), bytes.size());
}

Digest ContentHash::digest() const { return digestOf(XXH3_128bits_digest(state_.get())); }

Digest hashOf(std::string_view text) { return digestOf(XXH3_128bits(text.data(), text.size())); }

} // namespace quorl::wearable
