#pragma once

#include <string>
#include <vector>

#include "services/preferences/Pointers.h"

namespace quorl::preferences {

/// Where the values are kept: in dconf where it can store something, else in the memory of this
/// process; there they begin as dconf has them, as far as it can be read.
///
/// Not for several threads at once.
class Backend {
  public:
    /// Make it in the GLib context that hears of the loss of the session bus; that context must be
    /// iterated for as long as this object lives.
    explicit Backend(const std::vector<SchemaPointer>& schemas);

    /// To make a GSettings with.
    [[nodiscard]] GSettingsBackend* get() const { return backend_.get(); }

    /// Empty when other processes share the values. Otherwise a sentence that says why they do not,
    /// and what to do.
    [[nodiscard]] const std::string& problem() const { return problem_; }

    /// Makes sure that there is a session bus to store values with, unless none is needed. Gives
    /// back an empty text, or a sentence that says what to do.
    [[nodiscard]] std::string connect();

    /// Returns when every change that was stored before has been announced in the contexts of those
    /// who listen; or when the dconf service does not say so in a moment.
    void awaitAnnouncements() const;

    /// Why a value may not have been stored though there is a session bus, as a sentence that says
    /// what to do. Asks the session bus, so it takes its time.
    [[nodiscard]] std::string storingProblem();

  private:
    void keepInMemory(const std::vector<SchemaPointer>& schemas);

    BackendPointer backend_;

    /// What GIO keeps for the whole process; held so that it stays the one whose loss does not end
    /// the process. Null when no bus is needed, or when there is none.
    ObjectPointer<GDBusConnection> bus_;

    std::string problem_;
};

} // namespace quorl::preferences
