#pragma once

#include "vexel/Exception.h"

// The implementation reaches the object behind each public class through
// this one friend.
namespace Vexel::detail {

struct Access {
  template <class T>
  static auto& ImplOf(const T& object) {
    return *object.impl_;
  }
  template <class T>
  static const auto& SharedImplOf(const T& object) {
    return object.impl_;
  }
};

}  // namespace Vexel::detail

namespace Vexel::internal {
using detail::Access;
}  // namespace Vexel::internal
