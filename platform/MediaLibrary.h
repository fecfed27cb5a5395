#pragma once

#include "platform/Foundation.h"

/// The media library. Main thread only. What a query gave stays as it was; a later query shows what
/// has changed.

/// Kinds of media, a mask.
enum MPMediaType : NSUInteger {
    MPMediaTypeMusic = 1U << 0U,
    MPMediaTypeMusicVideo = 1U << 11U,
};

/// The name of a property of an entity: a constant from below.
using MPMediaProperty = std::string_view;

/// The 64-bit id: a number.
extern const MPMediaProperty MPMediaPlaylistPropertyPersistentID;
/// Whether the playlist is a folder of playlists, a mix, or a playlist that a program made:
/// numbers.
extern const MPMediaProperty MPMediaPlaylistPropertyIsFolder;
extern const MPMediaProperty MPMediaPlaylistPropertyIsAugurMix;
extern const MPMediaProperty MPMediaPlaylistPropertyIsAugurPlaylist;
/// The revision: a number that changes whenever the entity's contents change.
extern const MPMediaProperty MPMediaEntityPropertyEntityRevision;
/// The size of an item's file in bytes: a number.
extern const MPMediaProperty MPMediaItemPropertyFileSize;

/// Anything in the library.
class MPMediaEntity : public NSObject {
  public:
    /// Stable over edits and restarts.
    [[nodiscard]] virtual std::uint64_t persistentID() const = 0;

    /// The value of a property, or null where the entity lacks it.
    [[nodiscard]] virtual std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const = 0;
};

/// A song or a music video.
class MPMediaItem : public MPMediaEntity {};

class MPMediaPlaylist : public MPMediaEntity {
  public:
    /// Null where the playlist has none.
    [[nodiscard]] virtual std::optional<std::string> name() const = 0;

    /// The items in playlist order; an item may be there more than once.
    [[nodiscard]] virtual NSArray<MPMediaItem> items() const = 0;
};

/// How a predicate compares.
enum class MPMediaPredicateComparison : NSInteger { EqualTo = 0 };

/// A condition on one property. Immutable.
class MPMediaPropertyPredicate final : public NSObject {
  public:
    MPMediaPropertyPredicate(std::shared_ptr<NSNumber> value, MPMediaProperty property,
                             MPMediaPredicateComparison comparisonType)
        : _value(std::move(value)), _property(property), _comparisonType(comparisonType) {}

    /// The property equals `value`.
    [[nodiscard]] static std::shared_ptr<MPMediaPropertyPredicate>
    predicateWithValue_forProperty(std::shared_ptr<NSNumber> value, MPMediaProperty property);

    [[nodiscard]] static std::shared_ptr<MPMediaPropertyPredicate>
    predicateWithValue_forProperty_comparisonType(std::shared_ptr<NSNumber> value,
                                                  MPMediaProperty property,
                                                  MPMediaPredicateComparison comparisonType);

    [[nodiscard]] const std::shared_ptr<NSNumber>& value() const { return _value; }

    [[nodiscard]] MPMediaProperty property() const { return _property; }

    [[nodiscard]] MPMediaPredicateComparison comparisonType() const { return _comparisonType; }

  private:
    std::shared_ptr<NSNumber> _value;
    MPMediaProperty _property;
    MPMediaPredicateComparison _comparisonType;
};

/// A question to the media library, asked anew at each `collections`.
class MPMediaQuery : public NSObject {
  public:
    /// A query for all playlists.
    [[nodiscard]] static std::shared_ptr<MPMediaQuery> playlistsQuery();

    /// Leaves only what fulfils `predicate` and all those added before.
    void addFilterPredicate(std::shared_ptr<MPMediaPropertyPredicate> predicate);

    /// The playlists that fulfil every predicate, in the library's order; never null.
    [[nodiscard]] NSArray<MPMediaPlaylist> collections() const;

  private:
    std::vector<std::shared_ptr<MPMediaPropertyPredicate>> _predicates;
};

class MPMediaLibrary : public NSObject {
  public:
    /// The device's library, the one object of the process.
    [[nodiscard]] static MPMediaLibrary& defaultMediaLibrary();

    /// Whether the library holds an item of any type in `mask`.
    [[nodiscard]] virtual bool hasMediaOfType(NSUInteger mask) const = 0;

    /// From the first begin to the end that matches it, changes of the library are announced. The
    /// calls nest; an end too many does nothing.
    virtual void beginGeneratingLibraryChangeNotifications() = 0;
    virtual void endGeneratingLibraryChangeNotifications() = 0;
};

/// Posted on the main thread, with the library as object, after the library has changed, while
/// somebody wants to know.
extern const NSNotificationName MPMediaLibraryDidChangeNotification;
