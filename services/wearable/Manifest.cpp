#include "services/wearable/Manifest.h"

#include <algorithm>
#include <concepts>

#include <nlohmann/json.hpp>

#include "services/wearable/ManifestReader.h"
#include "services/wearable/Wearable.h"

namespace quorl::wearable {

namespace {

using nlohmann::json;

constexpr int hexadecimal = 16;

/// Paths are bytes, and JSON is UTF-8: what is not plain ASCII is kept as %XX.
std::string encoded(std::string_view bytes) {
    constexpr std::string_view digits = "0123456789ABCDEF";
    std::string text;
    for (const char byte : bytes) {
        const auto value = static_cast<unsigned char>(byte);
        if (byte >= ' ' && byte <= '~' && byte != '%') {
            text += byte;
        } else {
            text += '%';
            text += digits[value / hexadecimal];
            text += digits[value % hexadecimal];
        }
    }
    return text;
}

/// Most strings are written as they are.
bool isPlain(std::string_view text) {
    return std::ranges::all_of(
        text, [](char byte) { return byte >= ' ' && byte <= '~' && byte != '"' && byte != '\\'; });
}

/// The object of the manifest as text, whose members come one by one, in the order of their names.
class Writer {
  public:
    explicit Writer(const TextSink& sink) : sink_(sink) {}

    void begin(char bracket) {
        text_ += bracket;
        isFirst_ = true;
        ++depth_;
    }

    void end(char bracket) {
        --depth_;
        if (!isFirst_) {
            newLine();
        }
        text_ += bracket;
        isFirst_ = false;
    }

    /// What follows is another element.
    void next() {
        text_ += isFirst_ ? "" : ",";
        isFirst_ = false;
        newLine();
    }

    /// What follows is the value of this member.
    void key(std::string_view name) {
        next();
        text_.append("\"").append(name).append("\": ");
    }

    void member(std::string_view name, std::string_view value) {
        key(name);
        if (isPlain(value)) {
            text_.append("\"").append(value).append("\"");
        } else {
            text_ += json(value).dump();
        }
    }

    template <std::integral Number>
    void member(std::string_view name, Number value) {
        key(name);
        text_ += std::to_string(value);
    }

    /// The sink gets what has come so far.
    void giveOn() {
        sink_(text_);
        text_.clear();
    }

    void finish() {
        text_ += '\n';
        giveOn();
    }

  private:
    void newLine() { text_.append("\n").append(depth_, ' '); }

    const TextSink& sink_;
    std::string text_;
    std::size_t depth_ = 0;
    bool isFirst_ = true;
};

void write(Writer& writer, const Entry& entry) {
    writer.begin('{');
    writer.member("hash", entry.hash ? toText(*entry.hash) : "");
    writer.member("modified", entry.modified);
    writer.member("name", entry.name());
    writer.member("size", entry.size);
    writer.member("source", encoded(entry.source()));
    writer.end('}');
}

void write(Writer& writer, const Selection& selection) {
    writer.begin('{');
    writer.member("limit", selection.limit);
    writer.member("limitType", selection.limitType);
    writer.member("playlist", selection.playlist);
    writer.member("revision", selection.revision);
    writer.end('}');
}

void write(Writer& writer, const std::vector<Entry>& entries) {
    writer.begin('[');
    for (const auto& entry : entries) {
        writer.next();
        write(writer, entry);
        writer.giveOn();
    }
    writer.end(']');
}

template <class Text>
Manifest parsed(Text& text) {
    try {
        return readManifest(text);
    } catch (const WrongManifest& error) {
        rejectManifest(error.what());
    }
}

} // namespace

void rejectManifest(const std::string& why) {
    throw BadManifest{{unseen::badManifest, {why}},
                      "The list of the music on the " + std::string{wearableName} +
                          " cannot be used (" + why + "). Remove the files " + ownDirectory +
                          "/manifest.* from it to begin anew; the music that is on it then stays."};
}

void writeText(const Manifest& manifest, const TextSink& sink) {
    Writer writer(sink);
    writer.begin('{');
    writer.member("format", manifestFormat);
    if (manifest.playlist) {
        writer.key("playlist");
        write(writer, *manifest.playlist);
    }
    if (manifest.sent) {
        writer.key("sent");
        write(writer, *manifest.sent);
    }
    writer.key("songs");
    write(writer, manifest.songs);
    writer.key("strays");
    write(writer, manifest.strays);
    writer.end('}');
    writer.finish();
}

std::string toText(const Manifest& manifest) {
    std::string text;
    writeText(manifest, [&](std::string_view piece) { text += piece; });
    return text;
}

Manifest parseManifest(std::streambuf& text) {
    const bool isEmpty = text.sgetc() == std::streambuf::traits_type::eof();
    return isEmpty ? Manifest() : parsed(text);
}

Manifest parseManifest(std::string_view text) { return text.empty() ? Manifest() : parsed(text); }

} // namespace quorl::wearable
