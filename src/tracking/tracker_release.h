#pragma once

#include "tracking/ocr_tracker.h"

namespace zeph {

// Destroys a tracker created with `new` (an OcrTrackerRotRect from the
// bridge) through its OcrTracker base and frees its memory. Only the base's
// members are destroyed; the members a derived tracker adds are not.
void ReleaseTracker(OcrTracker* tracker);

}  // namespace zeph
