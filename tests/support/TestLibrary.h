#pragma once

#include "runtime/services/AnnouncingLibrary.h"
#include "tests/support/Journal.h"

namespace quorl::tests {

/// An entity whose properties the test sets; with a line "property ID NAME" for each that is read.
template <std::derived_from<MPMediaEntity> Base>
class TestEntity : public Base {
  public:
    TestEntity(std::uint64_t persistentID, Journal& journal)
        : persistentID_(persistentID), journal_(journal) {}

    void setProperty(MPMediaProperty property, std::shared_ptr<NSObject> value) {
        properties_[property] = std::move(value);
    }

    [[nodiscard]] std::uint64_t persistentID() const override { return persistentID_; }

    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override {
        journal_.note("property " + std::to_string(persistentID_) + " " + std::string(property));
        const auto found = properties_.find(property);
        return found == properties_.end() ? nullptr : found->second;
    }

  protected:
    [[nodiscard]] Journal& journal() { return journal_; }

  private:
    std::uint64_t persistentID_;
    Journal& journal_;
    std::map<MPMediaProperty, std::shared_ptr<NSObject>> properties_;
};

using TestItem = TestEntity<MPMediaItem>;

class TestPlaylist final : public TestEntity<MPMediaPlaylist> {
  public:
    using TestEntity::TestEntity;

    void setName(std::optional<std::string> name) { name_ = std::move(name); }

    void setRevision(std::uint64_t revision);

    /// One song for each size, in this order, with ids from 1 on. A null size: a song whose size is
    /// not known.
    void setSongSizes(const std::vector<std::optional<std::uint64_t>>& sizes);

    [[nodiscard]] std::optional<std::string> name() const override { return name_; }

    [[nodiscard]] NSArray<MPMediaItem> items() const override { return items_; }

  private:
    std::optional<std::string> name_;
    NSArray<MPMediaItem> items_;
};

/// A library in memory, with a line for each call: "library hasMediaOfType MASK", "library begin",
/// "library end", and "query NAME=VALUE ..." with the predicates in their order.
class TestLibrary final : public AnnouncingLibrary {
  public:
    explicit TestLibrary(Journal& journal) : journal_(journal) {}

    /// Adds an ordinary playlist at the end.
    std::shared_ptr<TestPlaylist> addPlaylist(std::uint64_t persistentID,
                                              std::optional<std::string> name);

    void removePlaylist(const std::shared_ptr<TestPlaylist>& playlist);

    /// The types of which the library has items; music unless set.
    void setMediaTypes(NSUInteger mask) { mediaTypes_ = mask; }

    /// What happens while the library is asked for its types the next time.
    void duringNextQuestion(std::function<void()> act) { duringQuestion_ = std::move(act); }

    [[nodiscard]] bool hasMediaOfType(NSUInteger mask) const override;
    void beginGeneratingLibraryChangeNotifications() override;
    void endGeneratingLibraryChangeNotifications() override;
    [[nodiscard]] NSArray<MPMediaPlaylist>
    playlistsMatching(const Predicates& predicates) const override;

  private:
    Journal& journal_;
    std::vector<std::shared_ptr<TestPlaylist>> playlists_;
    NSUInteger mediaTypes_ = MPMediaTypeMusic;
    mutable std::function<void()> duringQuestion_;
};

} // namespace quorl::tests
