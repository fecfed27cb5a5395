#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <streambuf>
#include <string>
#include <string_view>
#include <vector>

#include "services/wearable/ContentHash.h"
#include "services/wearable/TextPair.h"
#include "services/wearable/Unseen.h"

namespace quorl::wearable {

/// A file in the wearable's music directory that we have put there, or are about to. Takes little
/// memory, for there are many; its copies share the texts.
class Entry {
  public:
    Entry() = default;

    Entry(std::string_view name, std::string_view source, std::uint64_t bytes,
          std::int64_t modifiedAt, std::optional<Digest> hashOfContents)
        : size(bytes), modified(modifiedAt), hash(hashOfContents), texts_(name, source) {}

    /// In the music directory itself, never in a directory below.
    [[nodiscard]] std::string_view name() const { return texts_.first(); }

    void rename(std::string_view name) { texts_ = TextPair(name, source()); }

    /// What it is a copy of: a path relative to the music folder, in the bytes of the file system.
    /// For a playlist, its title.
    [[nodiscard]] std::string_view source() const { return texts_.second(); }

    /// In bytes.
    std::uint64_t size = 0;
    /// Modification time of the source, which the copy has too; nanoseconds since 1970.
    std::int64_t modified = 0;
    /// Of the contents; nothing as long as it is not known.
    std::optional<Digest> hash;

    bool operator==(const Entry&) const = default;

  private:
    TextPair texts_;
};

/// Which songs are sent: those of a playlist as it was at one moment, up to a limit.
struct Selection {
    std::uint64_t playlist = 0;
    std::uint64_t revision = 0;
    /// As in the preferences.
    std::uint64_t limitType = 0;
    std::uint64_t limit = 0;

    bool operator==(const Selection&) const = default;
};

/// Which files on a wearable are ours. Everything else there belongs to somebody else, and is
/// neither changed nor removed.
struct Manifest {
    /// All of these are there, complete. Each source once.
    std::vector<Entry> songs;
    /// The playlist file; nothing where none was written.
    std::optional<Entry> playlist;
    /// Ours where they are there: about to be copied, or about to be removed, when the list was
    /// written. Complete where they are there at all.
    std::vector<Entry> strays;
    /// What was sent, if the last sync got everything done.
    std::optional<Selection> sent;

    bool operator==(const Manifest&) const = default;
};

/// The list on a wearable says something that we have never written.
class BadManifest : public CannotBeSeen {
  public:
    using CannotBeSeen::CannotBeSeen;
};

/// Throws `BadManifest` with a sentence that says what to do.
/// @param why in English; whoever words the message translates it.
[[noreturn]] void rejectManifest(const std::string& why);

/// Takes a text, one piece after the other.
using TextSink = std::function<void(std::string_view piece)>;

/// As text, to be read by `parseManifest`.
void writeText(const Manifest& manifest, const TextSink& sink);

/// All of it in one piece.
[[nodiscard]] std::string toText(const Manifest& manifest);

/// An empty text gives an empty manifest. Throws `BadManifest`, whose text says what to do, and
/// what reading `text` throws. No name in the result leads out of the music directory.
[[nodiscard]] Manifest parseManifest(std::streambuf& text);
[[nodiscard]] Manifest parseManifest(std::string_view text);

} // namespace quorl::wearable
