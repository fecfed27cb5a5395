#include "platform/Class.h"

#include <cstdlib>

#include <cxxabi.h>

std::string Class::name() const {
    int status = 0;
    const std::unique_ptr<char, decltype(&std::free)> demangled(
        abi::__cxa_demangle(_type->name(), nullptr, nullptr, &status), &std::free);
    return status == 0 ? demangled.get() : _type->name();
}

std::shared_ptr<NSObject> Class::create() const { return _factory ? _factory() : nullptr; }
