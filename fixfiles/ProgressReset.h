#pragma once

#include "fixfiles/ProgressBar.h"

namespace dovrel {

// Empties the progress bar when a scan starts and again when it ends, however
// it ends, so that a failed scan does not leave the bar half full.
class ProgressReset {
public:
    explicit ProgressReset(ProgressBar& progress) : progress_(progress) { progress_.reset(); }
    ~ProgressReset() { progress_.reset(); }
    ProgressReset(const ProgressReset&) = delete;
    ProgressReset& operator=(const ProgressReset&) = delete;

private:
    ProgressBar& progress_;
};

} // namespace dovrel
