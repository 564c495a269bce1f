#include "tracking/tracker_release.h"

#include <new>

namespace zeph {

void ReleaseTracker(OcrTracker* tracker) {
  if (tracker == nullptr)
    return;
  // Released trackers have always been destroyed through the plain base,
  // which has no virtual destructor: the reference frame and point lists are
  // freed, the rotated-rectangle tracker's two reference lists are not (a
  // small, accepted leak per tracking run). This is kept deliberately. It is
  // written as a base destructor call plus an unsized operator delete rather
  // than `delete tracker`, whose sized deallocation would name the base's
  // size for a derived allocation.
  tracker->~OcrTracker();
  ::operator delete(static_cast<void*>(tracker));
}

}  // namespace zeph
