# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""No header of host/include gives more than the platform's header of the same name.

What compiles on a host only because a header is generous does not compile on a phone.
"""

import re

HOME = "host/include"
GENERATED = ("android/hidl/base/1.0/IBase.h android/hidl/manager/1.0/IServiceNotification.h "
             "hidl/HidlSupport.h hidl/MQDescriptor.h hidl/Status.h utils/NativeHandle.h utils/misc.h")

# What each header of Android 11 includes, of the HIDL runtime (system/libhidl, system/libhwbinder)
# and of libutils; the C++ headers where a source could lean on them.
PLATFORM = {
    "android/hidl/manager/1.0/IServiceManager.h": GENERATED,
    "android/hidl/manager/1.0/IServiceNotification.h": GENERATED,
    "hidl/ConcurrentMap.h": "map mutex",
    "hidl/GtestPrinter.h": "gtest/gtest.h cctype string",
    "hidl/HidlBinderSupport.h":
        "android/hidl/base/1.0/BnHwBase.h android/hidl/base/1.0/IBase.h hidl/HidlSupport.h "
        "hidl/HidlTransportUtils.h hidl/MQDescriptor.h hwbinder/IBinder.h hwbinder/Parcel.h "
        "log/log.h sys/types.h",
    "hidl/HidlInternal.h": "string",
    "hidl/HidlPassthroughSupport.h": "android/hidl/base/1.0/IBase.h",
    "hidl/HidlSupport.h":
        "algorithm array iterator map sstream tuple type_traits vector cutils/native_handle.h "
        "hidl/HidlInternal.h hidl/Status.h utils/Errors.h utils/RefBase.h utils/StrongPointer.h",
    # The generated proxies have a mutex, and only this header could declare it.
    "hidl/HidlTransportSupport.h":
        "android/hidl/base/1.0/IBase.h hidl/HidlBinderSupport.h hidl/HidlPassthroughSupport.h "
        "hidl/HidlSupport.h hidl/HidlTransportUtils.h hidl/ServiceManagement.h mutex",
    "hidl/HidlTransportUtils.h": "android/hidl/base/1.0/IBase.h",
    "hidl/MQDescriptor.h":
        "hidl/HidlInternal.h hidl/HidlSupport.h cutils/native_handle.h unistd.h",
    "hidl/ServiceManagement.h":
        "string vector utils/StrongPointer.h android/hidl/base/1.0/IBase.h",
    "hidl/Static.h":
        "functional hidl/ConcurrentMap.h hwbinder/IBinder.h hwbinder/IInterface.h "
        "utils/StrongPointer.h android/hidl/base/1.0/IBase.h",
    "hidl/Status.h":
        "cstdint sstream hidl/HidlInternal.h utils/Errors.h utils/StrongPointer.h",
    "hidl/TaskRunner.h": "memory thread functional",
    "hwbinder/Binder.h": "atomic hwbinder/IBinder.h",
    "hwbinder/IBinder.h": "functional utils/Errors.h utils/RefBase.h utils/String16.h",
    "hwbinder/IInterface.h": "hwbinder/Binder.h",
    "hwbinder/Parcel.h":
        "string vector cutils/native_handle.h hwbinder/IInterface.h utils/Errors.h utils/RefBase.h "
        "utils/String16.h memory",
    "hwbinder/ProcessState.h":
        "pthread.h hwbinder/IBinder.h utils/KeyedVector.h utils/String16.h utils/String8.h "
        "utils/threads.h",
    # Not the host layer's: the generated base interface, and Debian's libutils.
    "android/hidl/base/1.0/IBase.h":
        "hidl/HidlSupport.h hidl/MQDescriptor.h hidl/Status.h utils/NativeHandle.h utils/misc.h",
    "utils/RefBase.h": "atomic functional type_traits utils/StrongPointer.h",
}
# A source that includes any C++ header has these as well.
ALWAYS = {"cstddef", "cstdint", "string", "type_traits", "utility"}

# Named there, and nowhere defined: who needs one whole includes its own header.
DECLARED_ONLY = {
    "hidl/HidlSupport.h": ["IBase", "IMemory"],
    "hidl/ServiceManagement.h": ["IServiceManager"],
    "hidl/TaskRunner.h": ["SynchronizedQueue"],
    "hwbinder/IBinder.h": ["BHwBinder", "BpHwBinder", "IInterface", "Parcel"],
    "hwbinder/Parcel.h": ["IBinder", "ProcessState"],
}


def verify(checkout):
    for path in checkout.paths(HOME, "**/*.h"):
        name = path.removeprefix(f"{HOME}/")
        if name not in PLATFORM:
            checkout.report(path, 1, "Android 11 has no header of this name")
            continue
        brought = everything(name)
        for number, line in enumerate(checkout.text(path).splitlines(), 1):
            included = re.match(r"#include <(.+)>", line)
            if included and included[1] not in brought:
                checkout.report(path, number, f"Android 11's does not bring {included[1]}")
            defined = re.match(r"(?:class|struct) (\w+)\b[^;]*$", line)
            if defined and defined[1] in DECLARED_ONLY.get(name, []):
                checkout.report(path, number, f"Android 11's only declares {defined[1]}")


def everything(name):
    """What the platform's header gives, also through headers that it includes."""
    found, waiting = set(ALWAYS), [name]
    while waiting:
        for included in PLATFORM.get(waiting.pop(), "").split():
            if included not in found:
                found.add(included)
                waiting.append(included)
    return found
