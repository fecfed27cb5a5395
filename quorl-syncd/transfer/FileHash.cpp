#include "quorl-syncd/transfer/FileHash.h"

#include <memory>
#include <span>

#include "quorl-syncd/transfer/Stopped.h"

namespace quorl::syncd {

wearable::Digest hashOf(base::Reader& reader, const std::stop_token& stop) {
    constexpr std::size_t pieceSize = 1 << 20;
    wearable::ContentHash hash;
    const auto memory = std::make_unique_for_overwrite<std::byte[]>(pieceSize);
    const std::span buffer(memory.get(), pieceSize);
    for (;;) {
        stopIf(stop);
        const auto size = reader.read(buffer);
        if (size == 0) {
            return hash.digest();
        }
        hash.add(buffer.first(size));
    }
}

} // namespace quorl::syncd
