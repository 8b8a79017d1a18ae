// A JPEG library without ijlWrite: the wrapper must treat it as unavailable.
struct JPEG_CORE_PROPERTIES;

extern "C" __attribute__((visibility("default"))) int ijlInit(JPEG_CORE_PROPERTIES*) { return 0; }
extern "C" __attribute__((visibility("default"))) int ijlFree(JPEG_CORE_PROPERTIES*) { return 0; }
extern "C" __attribute__((visibility("default"))) int ijlRead(JPEG_CORE_PROPERTIES*, int) { return 0; }
