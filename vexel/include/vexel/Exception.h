#pragma once

#include <stdexcept>

namespace Vexel {

// Every failure the kit reports: a shader that does not compile or link, a
// font file that cannot be found or read, a mesh defined inconsistently, a
// graphics device that cannot be brought up. what() says which and why.
class Exception : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

namespace detail {
// The implementation's way into the objects behind the public classes.
struct Access;
}  // namespace detail

}  // namespace Vexel
