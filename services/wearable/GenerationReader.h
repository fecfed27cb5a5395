#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <streambuf>
#include <string>
#include <string_view>

#include "services/base/Reader.h"
#include "services/wearable/Checksum.h"
#include "services/wearable/Manifest.h"

namespace quorl::wearable {

/// A file as a text of which one piece at a time is in memory.
class TextInPieces final : public std::streambuf {
  public:
    /// Reads the first piece, which is the whole text where that is short.
    explicit TextInPieces(std::unique_ptr<base::Reader> reader);

    /// What is left of the piece.
    [[nodiscard]] std::string_view rest() const;

    /// Passes over so many bytes of that.
    void skip(std::size_t bytes) { setg(eback(), gptr() + bytes, egptr()); }

    /// Everything from here on has a checksum.
    void beginChecksum();

    /// Reads to the end.
    [[nodiscard]] std::string checksumToEnd();

  protected:
    int_type underflow() override;

  private:
    [[nodiscard]] bool readPiece();

    const std::unique_ptr<base::Reader> reader_;
    const std::unique_ptr<char[]> piece_;
    bool isAtEnd_ = false;
    std::optional<Checksum> checksum_;
};

/// One of the two files of the manifest.
class GenerationReader {
  public:
    /// Only reads the beginning.
    explicit GenerationReader(std::unique_ptr<base::Reader> reader);

    /// As the file says; 0 where it says none.
    [[nodiscard]] std::uint64_t number() const { return number_; }

    /// Nothing where the file is not as it was written. Throws `BadManifest`. To be called once.
    [[nodiscard]] std::optional<Manifest> read();

  private:
    void readFirstLine();

    TextInPieces text_;
    std::string checksum_;
    std::uint64_t number_ = 0;
};

} // namespace quorl::wearable
