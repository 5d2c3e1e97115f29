/* sys1.h - the lock service that the library needs from its host.
 *
 * A lock object is 28 bytes of storage, all zero at first and aligned for a 32-bit word. What they
 * hold is up to the service; nothing initialises or destroys them. The library has one lock. It
 * holds it while it changes its list of locale objects, and never while it calls ICU.
 *
 * It also holds the lock across fork(2): the thread that forks gets the lock before, and releases
 * it afterwards, in the parent and in the child. So the child's one thread must be able to release
 * it, although it has another thread id than the thread that got it.
 *
 * As with trc1.h, a host's own definitions replace those of libzelhost.so.
 */
#ifndef SYS1_H
#define SYS1_H

#ifdef __cplusplus
extern "C" {
#endif

/* Keeps a host's definitions visible to the library in a program whose symbols are hidden by
 * default. */
#if defined(__GNUC__)
#define SYS1_API __attribute__((visibility("default")))
#else
#define SYS1_API
#endif

enum { SYS1_LOCK_SIZE = 28 };

/* Blocks until the caller holds the lock. Not recursive. */
SYS1_API void SYS1_GetLock(void *lock);

/* Releases a lock that the caller holds. */
SYS1_API void SYS1_ReleaseLock(void *lock);

#ifdef __cplusplus
}
#endif

#endif
