#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "quorl-simulate/Random.h"

namespace quorl::simulation {

/// What a file system promises of what it was not told to make durable.
enum class DiskRules {
    Posix, ///< nothing, but that a rename happens or does not; as ext4, f2fs and btrfs all keep
    Fat,   ///< less: see `SimulatedDisk`
};

/// A file system in memory that can lose power.
///
/// What was written reaches the medium when it is made durable; of the rest, a loss of power keeps
/// any part. By the rules of FAT, names fold case and have short aliases, times are kept to two
/// seconds, a file has a largest size, a rename can leave both names or neither, a name tells the
/// size and the place of its file only once the file was made durable under it, and two names that
/// were left for one file share its clusters, which the removal of either gives away.
///
/// Its clock stands but for half a second with each change.
///
/// Every failure throws `std::system_error`, as the system calls of the same meaning fail. One
/// thread.
class SimulatedDisk {
  public:
    using Node = std::uint32_t;

    static constexpr Node top = 0;

    struct Status {
        std::uint64_t size = 0;
        std::int64_t modified = 0; ///< nanoseconds since 1970
        bool isDirectory = false;

        bool operator==(const Status&) const = default;
    };

    /// Called before each operation that reads or changes something, with its name and what it is
    /// done to. What it throws is what the operation does instead.
    using Before = std::function<void(std::string_view operation, std::string_view name)>;

    SimulatedDisk(DiskRules rules, std::uint64_t capacity, std::uint64_t largestFile);

    [[nodiscard]] DiskRules rules() const { return rules_; }

    void setBefore(Before before) { before_ = std::move(before); }

    /// Another number after each change, also of what is durable.
    [[nodiscard]] std::uint64_t revision() const { return revision_; }

    /// What others take of the space, in bytes.
    void setSpaceOfOthers(std::uint64_t bytes) { spaceOfOthers_ = bytes; }

    void setReadOnly(bool readOnly) { isReadOnly_ = readOnly; }

    /// A mere look is an operation, too, for those who call this before it.
    void look(std::string_view operation, std::string_view name) const { begin(operation, name); }

    [[nodiscard]] std::uint64_t available() const;

    [[nodiscard]] std::vector<std::string> names(Node directory) const;

    /// The file or directory of this name, also under another spelling by the rules of FAT; nothing
    /// where there is none.
    [[nodiscard]] std::optional<Node> find(Node directory, std::string_view name) const;

    /// As `find`, under this very spelling.
    [[nodiscard]] std::optional<Node> findExactly(Node directory, std::string_view name) const;

    [[nodiscard]] Status status(Node node) const;

    /// Whether another name has the same file.
    [[nodiscard]] bool isShared(Node directory, std::string_view name) const;

    /// Whether the file has this name, and all of its contents, also after a loss of power.
    [[nodiscard]] bool isDurable(Node directory, std::string_view name) const;

    [[nodiscard]] const std::string& read(Node file) const;

    /// All that a file of this name may hold, in full, after a loss of power; there may also be
    /// less of it, or none.
    [[nodiscard]] std::set<std::string> possibleContents(Node directory,
                                                         std::string_view name) const;

    [[nodiscard]] Node makeDirectory(Node directory, const std::string& name);

    /// Makes an empty file. Fails where the name is taken.
    [[nodiscard]] Node create(Node directory, const std::string& name);
    void append(Node file, std::string_view bytes);
    /// Writes over what is there, and beyond its end.
    void write(Node file, std::size_t offset, std::string_view bytes);
    void truncate(Node file);
    void setModified(Node file, std::int64_t nanoseconds);

    /// Moves a file. Fails where the new name is taken.
    void rename(Node directory, const std::string& name, Node newDirectory,
                const std::string& newName);
    void remove(Node directory, const std::string& name);

    /// Makes a file's contents, or a directory's names, durable.
    void sync(Node node);

    /// Makes everything durable.
    void syncAll();

    /// As `sync` of a medium that cannot write: fails, and what was to be made durable counts as
    /// durable from then on without being so, as Linux has it.
    void failSync(Node node);

    /// The same of `syncAll`: nothing that is not durable by now ever will be, unless it is made
    /// anew.
    void failSyncAll();

    /// Everything that was not durable becomes what `random` leaves of it.
    void losePower(Random& random);

  private:
    struct Content {
        std::string bytes;
        std::int64_t modified = 0;

        bool operator==(const Content&) const = default;
    };

    struct File {
        bool isDirectory = false;
        Content now;
        Content durable;
        bool isDirty = false; ///< the two may differ
        bool isLost = false;  ///< what differs is thought to be durable

        [[nodiscard]] bool isWhole() const { return !isDirty || now == durable; }
    };

    struct Entry {
        Node node = 0;
        bool isRecorded = true; ///< the name knows where and how large the file is
    };

    using Entries = std::map<std::string, Entry, std::less<>>;

    /// A name that was set or taken away and is not durable yet.
    struct Change {
        Node directory;
        std::string name;
        std::optional<Entry> entry;
        std::uint32_t step;  ///< changes of one step happen together, or not, by POSIX rules
        bool isLost = false; ///< thought to be durable
    };

    void begin(std::string_view operation, std::string_view name) const;
    void beginWriting(std::string_view operation, std::string_view name) const;
    [[nodiscard]] Entries::const_iterator entry(Node directory, std::string_view name) const;
    [[nodiscard]] Entries::const_iterator existing(Node directory, std::string_view name) const;
    void requireFree(Node directory, std::string_view name) const;
    void note(Node directory, const std::string& name, std::optional<Entry> entry);
    [[nodiscard]] Content& change(Node file);
    [[nodiscard]] std::int64_t kept(std::int64_t nanoseconds) const;
    void bringToMedium(Node file);
    void record(Node node);
    void recordAll();
    void recordName(Node directory, const std::string& name, Entry& entry);
    void keep(const Change& change);
    template <class Chosen>
    void keepNames(Chosen chosen);
    [[nodiscard]] Node add(Node directory, const std::string& name, bool isDirectory);
    [[nodiscard]] static Content remains(const File& file, Random& random);
    void chooseNames(Random& random);
    void chooseRecords(Random& random);

    const DiskRules rules_;
    const std::uint64_t capacity_;
    const std::uint64_t largestFile_;
    std::uint64_t spaceOfOthers_ = 0;
    bool isReadOnly_ = false;
    Before before_;

    std::vector<File> files_;
    std::map<Node, Entries> entries_;
    std::map<Node, Entries> durableEntries_;
    std::vector<Change> changes_;
    std::uint32_t step_ = 0;
    std::uint64_t revision_ = 0;
};

} // namespace quorl::simulation
