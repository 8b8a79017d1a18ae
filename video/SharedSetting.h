#ifndef AVPOST_VIDEO_SHAREDSETTING_H
#define AVPOST_VIDEO_SHAREDSETTING_H

namespace avpost::detail {

// The plain settings of a video stage are written by the host's thread and read by the frame
// path without the stage's lock. Each access is one relaxed atomic load or store of a single
// aligned word (a 32-bit setting or a pointer), so the members keep their documented types and
// layout and still never race. Stores release and loads acquire, so a watermark picture
// prepared before its pointer is published is seen complete by the frame path.
template <typename T>
inline T LoadSetting(const T& member)
{
    static_assert(sizeof(T) <= sizeof(void*), "settings are single words");
    T value;
    __atomic_load(&member, &value, __ATOMIC_ACQUIRE);
    return value;
}

template <typename T>
inline void StoreSetting(T& member, T value)
{
    static_assert(sizeof(T) <= sizeof(void*), "settings are single words");
    __atomic_store(&member, &value, __ATOMIC_RELEASE);
}

}  // namespace avpost::detail

#endif
