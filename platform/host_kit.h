// Marks the classes a host builds on (run loop, conference service, in-process conference):
// the component's shared library exports them, so their process-wide state exists once.
#pragma once

#if defined(__GNUC__)
#define QC_HOST_KIT __attribute__((visibility("default")))
#else
#define QC_HOST_KIT
#endif
