#ifndef AVPOST_VIDEO_SINGLELOCK_H
#define AVPOST_VIDEO_SINGLELOCK_H

#include <pthread.h>

#include "../media/AvpostApi.h"

// Holds a mutex for the lifetime of the guard: locked on construction, unlocked by the
// destructor, so every exit path of a scope releases it. A null mutex guards nothing.
class AVPOST_API CSingleLock {
public:
    explicit CSingleLock(pthread_mutex_t* mutex);
    virtual ~CSingleLock();
    CSingleLock(const CSingleLock&) = delete;
    CSingleLock& operator=(const CSingleLock&) = delete;

    pthread_mutex_t* mutex;
};

#endif
