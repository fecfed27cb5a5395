#include "runtime/plugins/BundleFiles.h"

#include <array>
#include <bit>
#include <cstdint>
#include <fstream>

#include <nettle/base16.h>
#include <nettle/sha2.h>

#include "runtime/plugins/BundleError.h"

namespace quorl {

std::string sha256(const std::string& bytes) {
    sha256_ctx context{};
    sha256_init(&context);
    sha256_update(&context, bytes.size(), std::bit_cast<const std::uint8_t*>(bytes.data()));
    std::array<std::uint8_t, SHA256_DIGEST_SIZE> digest{};
    sha256_digest(&context, digest.size(), digest.data());
    std::string text(BASE16_ENCODE_LENGTH(SHA256_DIGEST_SIZE), '\0');
    base16_encode_update(text.data(), digest.size(), digest.data());
    return text;
}

std::string readBundleFile(const std::filesystem::path& file, std::size_t maximumBytes) {
    std::error_code error;
    if (!std::filesystem::is_regular_file(file, error)) {
        throw BundleError(file, "this file is missing; install the plug-in again");
    }
    const auto size = std::filesystem::file_size(file, error);
    if (!error && size > maximumBytes) {
        throw BundleError(file, "this file is damaged: it is larger than any of its kind; "
                                "install the plug-in again");
    }
    std::string bytes(error ? 0 : static_cast<std::size_t>(size), '\0');
    std::ifstream stream(file, std::ios::binary);
    if (error || !stream.read(bytes.data(), static_cast<std::streamsize>(bytes.size()))) {
        throw BundleError(file, "this file cannot be read; check its permissions, or install the "
                                "plug-in again");
    }
    return bytes;
}

bool BundleFiles::has(const std::string& name) const {
    std::error_code ignored; // what cannot be asked for is not there
    return digests_.contains(name) || std::filesystem::exists(path(name), ignored);
}

std::string BundleFiles::read(const std::string& name) const {
    constexpr std::size_t maximumBytes = std::size_t{256} << 20; // far more than any plug-in has
    auto bytes = readBundleFile(path(name), maximumBytes);
    const auto digest = digests_.find(name);
    if (digest == digests_.end() || digest->second != sha256(bytes)) {
        throw BundleError(path(name),
                          "this file is damaged: it is not the one that the plug-in was "
                          "made with; install the plug-in again");
    }
    return bytes;
}

} // namespace quorl
