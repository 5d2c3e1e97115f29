/* sys1.h - the lock service that the library asks of its host.
 *
 * A lock object is 28 bytes of zero-initialised storage, aligned for a 32-bit word, whose contents
 * belong to the service: it is neither initialised nor destroyed. It is held only around changes
 * to the library's list of locale objects, never across a call of ICU. As with trc1.h, a host's own
 * definitions replace those of libzelhost.so.
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
