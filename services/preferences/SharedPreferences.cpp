#include "services/preferences/SharedPreferences.h"

#include <algorithm>
#include <deque>
#include <map>
#include <mutex>
#include <span>
#include <stop_token>
#include <thread>
#include <utility>
#include <vector>

#include "services/language/Translated.h"
#include "services/preferences/Backend.h"
#include "services/preferences/Schema.h"
#include "services/preferences/Variant.h"

namespace quorl::preferences {

using language::filled;
using language::translated;

namespace {

/// What was last known of a value; tells a change from elsewhere from the echo of an own write.
struct Known {
    VariantPointer value;

    /// How many announcements are still to come that are no news.
    unsigned echoes = 0;
};

/// Of the schema in `schemaNames`.
std::size_t placeOf(std::string_view schema) {
    const auto* const found = std::find(schemaNames.begin(), schemaNames.end(), schema);
    return static_cast<std::size_t>(found - schemaNames.begin());
}

bool equal(const VariantPointer& left, const VariantPointer& right) {
    return g_variant_equal(left.get(), right.get()) != FALSE;
}

} // namespace

class SharedPreferences::Store {
  public:
    using Listener = std::function<void(const KeySet& keys)>;

    explicit Store(const std::vector<SchemaPointer>& schemas);
    Store(const Store&) = delete;
    Store& operator=(const Store&) = delete;
    ~Store();

    /// Begins to tell of changes. Called once.
    void listen(Listener listener);

    /// Empty when the values are shared; see `Opened::problem`.
    [[nodiscard]] const std::string& problem() const { return backend_->problem(); }

    [[nodiscard]] VariantPointer read(const char* key) const;
    WriteResult write(const char* key, VariantPointer value);

  private:
    /// The keys that GSettings says have changed; none stands for any of them.
    using Announcement = KeySet;

    /// The handler of GSettings' `change-event`. GSettings calls it on the thread that runs the
    /// context, in the middle of a write where that thread writes, so it only takes note.
    static gboolean onChange(GSettings* settings, const GQuark* keys, int count, void* store);

    /// Those that wait in the context. While the own thread does not run.
    void takeAnnouncements() const;

    void run(const std::stop_token& stop);
    [[nodiscard]] KeySet takeChanges(const Announcement& announcement);

    /// Brings one value up to date; gives back whether that is news.
    bool takeChange(std::string_view key, Known& known, bool named) const;

    /// Asks the backend to store the value and waits for its answer. Gives back an empty text or
    /// why it was not stored.
    [[nodiscard]] std::string store(const char* key, const VariantPointer& value);
    [[nodiscard]] bool tryToStore(const char* key, const VariantPointer& value, Known& known);

    // Constant after construction.
    const ContextPointer context_;
    std::vector<SettingsPointer> settings_;             ///< in the order of `schemaNames`
    std::map<std::string_view, GSettings*> settingsOf_; ///< each key

    // Held while a value is read or written: GLib's memory backend has no lock of its own.
    mutable std::mutex touching_;

    // Held from the first look at a value until its write is through, or its change is known. Taken
    // before touching_, never while the listener is called.
    std::mutex knowing_;
    std::optional<Backend> backend_;
    std::map<std::string_view, Known> known_;

    // The own thread only.
    Listener listener_;
    std::deque<Announcement> announcements_;

    std::jthread thread_;
};

SharedPreferences::Store::Store(const std::vector<SchemaPointer>& schemas)
    : context_(g_main_context_new()) {
    // GIO announces changes in the context that is the thread's default when the settings are made.
    g_main_context_push_thread_default(context_.get());
    backend_.emplace(schemas);
    for (const auto& schema : schemas) {
        settings_.emplace_back(g_settings_new_full(schema.get(), backend_->get(), nullptr));
    }
    g_main_context_pop_thread_default(context_.get());
    backend_->awaitAnnouncements();
    takeAnnouncements(); // nobody listens yet: what is known from the beginning is no news

    forEachPreference([this](const auto& preference) {
        settingsOf_.emplace(preference.key, settings_.at(placeOf(preference.schema)).get());
        known_.emplace(preference.key, Known{read(preference.key), 0});
    });
    for (const auto& settings : settings_) {
        g_signal_connect(settings.get(), "change-event", G_CALLBACK(onChange), this);
    }
}

void SharedPreferences::Store::listen(Listener listener) {
    listener_ = std::move(listener);
    thread_ = std::jthread([this](const std::stop_token& stop) { run(stop); });
}

SharedPreferences::Store::~Store() {
    thread_.request_stop();
    g_main_context_wakeup(context_.get());
    if (thread_.joinable()) {
        thread_.join();
    }

    // Announcements that are still queued hold a reference to the settings until they have run.
    for (const auto& settings : settings_) {
        g_signal_handlers_disconnect_by_data(settings.get(), this);
    }
    settings_.clear();
    takeAnnouncements();
}

void SharedPreferences::Store::takeAnnouncements() const {
    while (g_main_context_iteration(context_.get(), FALSE)) {
    }
}

VariantPointer SharedPreferences::Store::read(const char* key) const {
    const std::scoped_lock lock(touching_);
    return VariantPointer(g_settings_get_value(settingsOf_.at(key), key));
}

WriteResult SharedPreferences::Store::write(const char* key, VariantPointer value) {
    const std::scoped_lock lock(knowing_);
    if (equal(read(key), value)) {
        return {};
    }
    if (const auto problem = store(key, value); !problem.empty()) {
        return {false, filled(translated("The setting {key} was not changed. {problem}"),
                              {{"key", key}, {"problem", problem}})};
    }
    known_.at(key).value = std::move(value);
    return {true, {}};
}

std::string SharedPreferences::Store::store(const char* key, const VariantPointer& value) {
    if (g_settings_is_writable(settingsOf_.at(key), key) == FALSE) {
        return translated("The administrator of this machine has locked it.");
    }
    // The second try is for a dconf service that ended in the middle of the first; dconf starts it
    // again for the next write only.
    auto& known = known_.at(key);
    for (int tries = 0; tries < 2; ++tries) {
        if (auto problem = backend_->connect(); !problem.empty()) {
            return problem;
        }
        if (tryToStore(key, value, known)) {
            return {};
        }
    }
    return backend_->storingProblem();
}

bool SharedPreferences::Store::tryToStore(const char* key, const VariantPointer& value,
                                          Known& known) {
    const auto before = read(key);
    ++known.echoes;
    {
        const std::scoped_lock lock(touching_);
        g_settings_set_value(settingsOf_.at(key), key, value.get());
    }
    // Waits for dconf's answer. Without it, dconf would gather the writes that follow into one.
    g_settings_sync();

    // GSettings reports no failure, but takes its own copy of the value back and announces that
    // too. Another value than the one before means that ours was stored, though it may have been
    // replaced since.
    const bool stored = !equal(read(key), before);
    known.echoes += stored ? 0 : 1;
    return stored;
}

gboolean SharedPreferences::Store::onChange(GSettings* /*settings*/, const GQuark* keys, int count,
                                            void* store) {
    Announcement announcement;
    if (keys != nullptr) {
        for (const GQuark key : std::span(keys, static_cast<std::size_t>(count))) {
            announcement.insert(g_quark_to_string(key));
        }
    }
    static_cast<Store*>(store)->announcements_.push_back(std::move(announcement));
    return TRUE;
}

void SharedPreferences::Store::run(const std::stop_token& stop) {
    while (!stop.stop_requested()) {
        g_main_context_iteration(context_.get(), TRUE);
        while (!announcements_.empty() && !stop.stop_requested()) {
            const auto changes = takeChanges(announcements_.front());
            announcements_.pop_front();
            if (!changes.empty()) {
                listener_(changes);
            }
        }
    }
}

KeySet SharedPreferences::Store::takeChanges(const Announcement& announcement) {
    const std::scoped_lock lock(knowing_);
    KeySet changes;
    for (auto& [key, known] : known_) {
        const bool isNamed = announcement.contains(key);
        if ((isNamed || announcement.empty()) && takeChange(key, known, isNamed)) {
            changes.insert(key);
        }
    }
    return changes;
}

bool SharedPreferences::Store::takeChange(std::string_view key, Known& known, bool named) const {
    auto value = read(key.data());
    if (!equal(value, known.value)) {
        known.value = std::move(value);
        // dconf announces the whole folder when something changed before it was listening for sure,
        // and may then announce the same change by its name.
        known.echoes += named ? 0 : 1;
        return true;
    }
    if (named && known.echoes > 0) {
        --known.echoes;
        return false;
    }
    // A value that is named has changed, even if it went and came back. One that is not has not.
    return named;
}

SharedPreferences::SharedPreferences(std::unique_ptr<Store> store) : store_(std::move(store)) {}

SharedPreferences::~SharedPreferences() = default;

SharedPreferences::Opened SharedPreferences::open(Changed changed, base::Purpose purpose) {
    auto found = findSchemas(purpose);
    if (!found.problem.empty()) {
        return {nullptr, std::move(found.problem)};
    }
    std::unique_ptr<SharedPreferences> preferences(
        new SharedPreferences(std::make_unique<Store>(found.schemas)));
    auto& store = *preferences->store_;
    store.listen([&self = *preferences, changed = std::move(changed)](const KeySet& keys) {
        if (changed) {
            changed(self, keys);
        }
    });
    return {std::move(preferences), store.problem()};
}

template <class T>
T SharedPreferences::get(const Preference<T>& preference) const {
    return Stored<T>::unwrap(*store_->read(preference.key));
}

template <class T>
WriteResult SharedPreferences::set(const Preference<T>& preference,
                                   const std::type_identity_t<T>& value) {
    if (!isStorable<T>(value)) {
        return {false, filled(translated("The setting {key} was not changed: it holds text in "
                                         "UTF-8 only. Rename what it is to name."),
                              {{"key", preference.key}})};
    }
    return store_->write(preference.key, Stored<T>::wrap(value));
}

using OptionalNumber = std::optional<std::uint64_t>;
template bool SharedPreferences::get(const Preference<bool>&) const;
template std::uint64_t SharedPreferences::get(const Preference<std::uint64_t>&) const;
template OptionalNumber SharedPreferences::get(const Preference<OptionalNumber>&) const;
template std::string SharedPreferences::get(const Preference<std::string>&) const;
template WriteResult SharedPreferences::set(const Preference<bool>&, const bool&);
template WriteResult SharedPreferences::set(const Preference<std::uint64_t>&, const std::uint64_t&);
template WriteResult SharedPreferences::set(const Preference<OptionalNumber>&,
                                            const OptionalNumber&);
template WriteResult SharedPreferences::set(const Preference<std::string>&, const std::string&);

} // namespace quorl::preferences
