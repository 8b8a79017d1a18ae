#ifndef AVPOST_MEDIA_AVPOSTAPI_H
#define AVPOST_MEDIA_AVPOSTAPI_H

// The library is built with hidden visibility; only what carries this mark is exported.
#if defined(__GNUC__)
#define AVPOST_API __attribute__((visibility("default")))
#else
#define AVPOST_API
#endif

#endif
