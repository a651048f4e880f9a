#include "foundation/descriptor.h"

#include <unistd.h>

#include <utility>

namespace initialiser {

bool vorl_descriptor::close() noexcept {
    const int closing = std::exchange(number_, -1);
    return closing < 0 || ::close(closing) == 0;
}

} // namespace initialiser
