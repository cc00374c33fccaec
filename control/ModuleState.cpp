#include "control/ModuleState.h"

namespace dovrel {

ModuleState& ModuleState::ofThisThread() {
    thread_local ModuleState state;
    return state;
}

} // namespace dovrel
