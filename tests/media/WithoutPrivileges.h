#pragma once

#include <functional>

namespace quorl::media::test {

/// While one is there, this thread and those that it starts have no more rights in the file system
/// than any user, also when the tests are run by root.
class WithoutPrivileges {
  public:
    WithoutPrivileges();
    ~WithoutPrivileges();

    WithoutPrivileges(const WithoutPrivileges&) = delete;
    WithoutPrivileges& operator=(const WithoutPrivileges&) = delete;

  private:
    bool dropped_;
};

/// Does `act` with the rights that the process has, also where there are `WithoutPrivileges`.
void withPrivileges(const std::function<void()>& act);

} // namespace quorl::media::test
