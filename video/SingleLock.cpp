#include "video/SingleLock.h"

CSingleLock::CSingleLock(pthread_mutex_t* m) : mutex(m)
{
    if (mutex != nullptr)
        pthread_mutex_lock(mutex);
}

CSingleLock::~CSingleLock()
{
    if (mutex != nullptr)
        pthread_mutex_unlock(mutex);
}
