#include "services/media/kept/KeptInventory.h"

#include <algorithm>
#include <system_error>

#include "services/base/AtomicFile.h"
#include "services/base/Paths.h"
#include "services/media/kept/Columns.h"

namespace quorl::media {

namespace {

/// Another one where the columns, or what they mean, become others.
constexpr std::uint32_t format = 1;

constexpr const char* typeOfInventory = "(auayay"  // format, root, what there is
                                        "atatayau" // playlists: ids, revisions, names,
                                        "ayauayay" // paths, whether folders, generated,
                                        "auau"     // songs, where they end
                                        "ayau"     // directories
                                        "ayauau"   // songs: names, directories,
                                        "ataxay"   // sizes, times, kinds
                                        "ayauayau" // left out: playlists, entries,
                                        "ayau)";   // reasons

void write(ColumnWriter& writer, const std::vector<Playlist>& playlists) {
    std::vector<std::uint64_t> ids;
    std::vector<std::uint64_t> revisions;
    TextList names;
    TextList paths;
    std::vector<std::uint8_t> folders;
    std::vector<std::uint8_t> generated;
    std::vector<SongIndex> songs;
    std::vector<std::uint32_t> ends;
    for (const auto& playlist : playlists) {
        ids.push_back(playlist.id);
        revisions.push_back(playlist.revision);
        names.add(playlist.name);
        paths.add(playlist.path);
        folders.push_back(playlist.folder ? 1 : 0);
        generated.push_back(static_cast<std::uint8_t>(playlist.generated));
        songs.insert(songs.end(), playlist.songs.begin(), playlist.songs.end());
        ends.push_back(static_cast<std::uint32_t>(songs.size()));
    }
    writer.add(ids);
    writer.add(revisions);
    writer.add(names);
    writer.add(paths);
    writer.add(folders);
    writer.add(generated);
    writer.add(songs);
    writer.add(ends);
}

void write(ColumnWriter& writer, const SongTable& songs) {
    TextList names;
    std::vector<std::uint32_t> directories;
    std::vector<std::uint64_t> sizes;
    std::vector<std::int64_t> times;
    std::vector<std::uint8_t> kinds;
    for (SongIndex index = 0; index < songs.size(); ++index) {
        const auto song = songs[index];
        names.add(song.name);
        directories.push_back(songs.directoryOf(index));
        sizes.push_back(song.size);
        times.push_back(song.modified);
        kinds.push_back(static_cast<std::uint8_t>(song.kind));
    }
    writer.add(songs.directories());
    writer.add(names);
    writer.add(directories);
    writer.add(sizes);
    writer.add(times);
    writer.add(kinds);
}

void write(ColumnWriter& writer, const std::vector<LeftOut>& leftOut) {
    TextList playlists;
    TextList entries;
    TextList reasons;
    for (const auto& each : leftOut) {
        playlists.add(each.playlist);
        entries.add(each.entry);
        reasons.add(code(each.reason));
    }
    writer.add(playlists);
    writer.add(entries);
    writer.add(reasons);
}

std::string toBytes(const Inventory& inventory) {
    ColumnWriter writer;
    writer.add(std::vector{format});
    writer.add(inventory.root.native());
    writer.add(std::vector<std::uint8_t>{inventory.rootFound, inventory.hasAudio,
                                         inventory.hasMusicVideo});
    write(writer, inventory.playlists);
    write(writer, inventory.songs);
    write(writer, inventory.leftOut);
    return writer.bytes();
}

void require(bool isTrue) {
    if (!isTrue) {
        throw WrongColumns();
    }
}

template <class... Columns>
void requireSize(std::size_t size, const Columns&... columns) {
    require(((columns.size() == size) && ...));
}

/// The value of an enumeration whose last one is `last`.
template <class Value>
Value valueOf(std::uint8_t number, Value last) {
    require(number <= static_cast<std::uint8_t>(last));
    return static_cast<Value>(number);
}

std::vector<Playlist> readPlaylists(ColumnReader& reader) {
    const auto ids = reader.next<std::uint64_t>();
    const auto revisions = reader.next<std::uint64_t>();
    const auto names = reader.nextTexts();
    const auto paths = reader.nextTexts();
    const auto folders = reader.next<std::uint8_t>();
    const auto generated = reader.next<std::uint8_t>();
    const auto songs = reader.next<SongIndex>();
    const auto ends = reader.next<std::uint32_t>();
    requireSize(ids.size(), revisions, names, paths, folders, generated, ends);
    std::vector<Playlist> playlists;
    playlists.reserve(ids.size());
    std::uint32_t begin = 0;
    for (std::uint32_t at = 0; at < names.size(); ++at) {
        require(begin <= ends[at] && ends[at] <= songs.size());
        const auto listed = songs.subspan(begin, ends[at] - begin);
        begin = ends[at];
        playlists.push_back({ids[at],
                             revisions[at],
                             std::string(names[at]),
                             std::string(paths[at]),
                             folders[at] != 0,
                             valueOf(generated[at], Generated::Playlist),
                             {listed.begin(), listed.end()}});
    }
    return playlists;
}

SongTable readSongs(ColumnReader& reader) {
    SongTable songs;
    const auto paths = reader.nextTexts();
    for (std::uint32_t at = 0; at < paths.size(); ++at) {
        songs.addDirectory(paths[at]);
    }
    const auto names = reader.nextTexts();
    const auto directories = reader.next<std::uint32_t>();
    const auto sizes = reader.next<std::uint64_t>();
    const auto times = reader.next<std::int64_t>();
    const auto kinds = reader.next<std::uint8_t>();
    requireSize(names.size(), directories, sizes, times, kinds);
    for (std::uint32_t at = 0; at < names.size(); ++at) {
        require(directories[at] < paths.size());
        songs.add(directories[at],
                  {{}, names[at], sizes[at], times[at], valueOf(kinds[at], Kind::MusicVideo)});
    }
    songs.shrink();
    return songs;
}

std::vector<LeftOut> readLeftOut(ColumnReader& reader) {
    const auto playlists = reader.nextTexts();
    const auto entries = reader.nextTexts();
    const auto reasons = reader.nextTexts();
    requireSize(playlists.size(), entries, reasons);
    std::vector<LeftOut> leftOut;
    for (std::uint32_t at = 0; at < playlists.size(); ++at) {
        const auto reason = reasonOf(reasons[at]);
        require(reason.has_value());
        leftOut.push_back({std::string(playlists[at]), std::string(entries[at]), *reason});
    }
    return leftOut;
}

Inventory fromBytes(std::string_view bytes) {
    ColumnReader reader(typeOfInventory, bytes);
    const auto formats = reader.next<std::uint32_t>();
    require(formats.size() == 1 && formats[0] == format);
    Inventory inventory;
    inventory.root = reader.nextText();
    const auto there = reader.next<std::uint8_t>();
    requireSize(3, there);
    inventory.rootFound = there[0] != 0;
    inventory.hasAudio = there[1] != 0;
    inventory.hasMusicVideo = there[2] != 0;
    inventory.playlists = readPlaylists(reader);
    inventory.songs = readSongs(reader);
    inventory.leftOut = readLeftOut(reader);
    const auto isThere = [&](SongIndex song) { return song < inventory.songs.size(); };
    require(std::ranges::all_of(inventory.playlists, [&](const Playlist& playlist) {
        return std::ranges::all_of(playlist.songs, isThere);
    }));
    return inventory;
}

} // namespace

std::shared_ptr<const Inventory> keptInventory(const std::filesystem::path& file,
                                               const std::filesystem::path& root) {
    try {
        const auto directory = base::openRoot(file.parent_path().c_str());
        auto inventory = fromBytes(base::readFile(directory.get(), file.filename()));
        const bool isOfRoot = inventory.root == base::normal(std::filesystem::absolute(root));
        return isOfRoot ? std::make_shared<const Inventory>(std::move(inventory)) : nullptr;
    } catch (const std::system_error&) {
        return nullptr; // none was kept, or nobody may read it
    } catch (const WrongColumns&) {
        return nullptr; // the folder is read in any case, and the file is written anew
    }
}

void keepInventory(const std::filesystem::path& file, const Inventory& inventory) {
    base::makeDirectories(file.parent_path());
    base::replaceFile(base::openRoot(file.parent_path().c_str()).get(), file.filename(),
                      toBytes(inventory));
}

} // namespace quorl::media
