// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Debian's libutils is not built with ThreadSanitizer, which therefore does not see that whoever
// gives back the last reference to an object comes after those who gave back theirs. These two
// functions stand in front of the library's and say just that, so no report need be suppressed.

#include <dlfcn.h>
#include <sanitizer/tsan_interface.h>
#include <utils/RefBase.h>

namespace android {

void RefBase::decStrong(const void* id) const {
    using Function = void (*)(const RefBase*, const void*);
    static const auto original =
            reinterpret_cast<Function>(dlsym(RTLD_NEXT, "_ZNK7android7RefBase9decStrongEPKv"));
    __tsan_release(const_cast<RefBase*>(this));
    original(this, id);
}

// The library calls it between the last decrement and the end of the object, and its own does
// nothing.
void RefBase::onLastStrongRef(const void* /*id*/) {
    __tsan_acquire(this);
}

} // namespace android
