#pragma once

#include <memory>
#include <string>
#include <vector>

namespace quorl::syncd {

/// Says which directories a client cannot have the engine work with. One thread.
class DirectoryCheck {
  public:
    /// Gives back an empty text, or a sentence that says what to do. A directory that is not there
    /// is none of the engine's business: it may be that of a device that is not plugged in. Waits
    /// for a device that does not answer for a second, and not at all where several hang already.
    [[nodiscard]] std::string objectionTo(const std::string& directory);

  private:
    struct Answer;

    /// Of directories on devices that hang.
    std::vector<std::shared_ptr<Answer>> open_;
};

} // namespace quorl::syncd
