#include "services/wearable/GenerationReader.h"

#include <charconv>
#include <exception>
#include <span>
#include <utility>

namespace quorl::wearable {

namespace {

constexpr std::size_t pieceSize = 65536;

} // namespace

TextInPieces::TextInPieces(std::unique_ptr<base::Reader> reader)
    : reader_(std::move(reader)), piece_(std::make_unique_for_overwrite<char[]>(pieceSize)) {
    static_cast<void>(readPiece());
}

std::string_view TextInPieces::rest() const {
    return {gptr(), static_cast<std::size_t>(egptr() - gptr())};
}

void TextInPieces::beginChecksum() { checksum_.emplace().add(rest()); }

std::string TextInPieces::checksumToEnd() {
    while (readPiece()) {
    }
    return checksum_->text();
}

TextInPieces::int_type TextInPieces::underflow() {
    return readPiece() ? traits_type::to_int_type(*gptr()) : traits_type::eof();
}

/// False: there is no more.
bool TextInPieces::readPiece() {
    const std::span piece(piece_.get(), pieceSize);
    std::size_t size = 0;
    while (!isAtEnd_ && size < piece.size()) {
        const auto count = reader_->read(std::as_writable_bytes(piece.subspan(size)));
        size += count;
        isAtEnd_ = count == 0;
    }
    setg(piece.data(), piece.data(), piece.data() + size);
    if (checksum_) {
        checksum_->add(rest());
    }
    return size > 0;
}

GenerationReader::GenerationReader(std::unique_ptr<base::Reader> reader)
    : text_(std::move(reader)) {
    readFirstLine();
}

void GenerationReader::readFirstLine() {
    const auto text = text_.rest();
    const auto space = text.find(' ');
    const auto line = text.find('\n');
    if (line == std::string_view::npos || space > line) {
        return;
    }
    const auto digits = text.substr(space + 1, line - space - 1);
    std::uint64_t number = 0;
    std::from_chars(digits.data(), digits.data() + digits.size(), number);
    if (digits != std::to_string(number)) {
        return;
    }
    number_ = number;
    checksum_ = text.substr(0, space);
    text_.skip(space + 1);
    text_.beginChecksum();
    text_.skip(digits.size() + 1);
}

/// Whether anything is wrong with the text only matters where it is whole.
std::optional<Manifest> GenerationReader::read() {
    if (number_ == 0) {
        return std::nullopt;
    }
    Manifest manifest;
    std::exception_ptr problem;
    try {
        manifest = parseManifest(text_);
    } catch (const BadManifest&) {
        problem = std::current_exception();
    }
    if (text_.checksumToEnd() != checksum_) {
        return std::nullopt;
    }
    if (problem) {
        std::rethrow_exception(problem);
    }
    return manifest;
}

} // namespace quorl::wearable
