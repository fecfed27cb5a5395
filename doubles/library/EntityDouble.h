#pragma once

#include <algorithm>

#include "doubles/CallRecorder.h"

namespace quorl {

/// A song or playlist whose properties can be set.
template <std::derived_from<MPMediaEntity> Base>
class EntityDouble : public Base {
  public:
    EntityDouble(std::uint64_t persistentID, std::shared_ptr<CallRecorder> recorder)
        : persistentID_(persistentID), recorder_(std::move(recorder)) {}

    /// Null takes the property away.
    void setProperty(MPMediaProperty property, std::shared_ptr<NSNumber> value) {
        std::erase_if(properties_, [property](const auto& it) { return it.first == property; });
        if (value) {
            properties_.emplace_back(property, std::move(value));
        }
    }

    [[nodiscard]] std::uint64_t persistentID() const override { return persistentID_; }

    [[nodiscard]] std::shared_ptr<NSObject>
    valueForProperty(MPMediaProperty property) const override {
        recorder_->entityWillGiveProperty(*this, property);
        const auto found =
            std::find_if(properties_.begin(), properties_.end(),
                         [property](const auto& it) { return it.first == property; });
        return found == properties_.end() ? nullptr : found->second;
    }

  protected:
    [[nodiscard]] const std::shared_ptr<CallRecorder>& recorder() const { return recorder_; }

  private:
    std::uint64_t persistentID_;
    std::shared_ptr<CallRecorder> recorder_;
    std::vector<std::pair<MPMediaProperty, std::shared_ptr<NSNumber>>> properties_;
};

} // namespace quorl
