#pragma once

#include "platform/Controls.h"

#include <cmath>
#include <cstdint>

namespace dovrel {

// The control's progress bar: the filled shape grows inside the frame.
struct ProgressBar {
    Shape& frame;
    Shape& fill;

    void reset() { fill.setWidth(0); }
    // done of total, rounded to the nearest twip (halves to even).
    void show(int64_t done, int64_t total) {
        if (total <= 0)
            return;
        double width = static_cast<double>(frame.Width()) * static_cast<double>(done) /
                       static_cast<double>(total);
        fill.setWidth(static_cast<int32_t>(std::nearbyint(width)));
    }
};

} // namespace dovrel
