/// @file
#pragma once

#include <pthread.h>

#include "support/NextFunction.h"

// A sanitizer's, when there is one: it must know of every thread.
extern "C" [[gnu::weak]] int __interceptor_pthread_create(pthread_t* thread,
                                                          const pthread_attr_t* attributes,
                                                          void* (*start)(void*), void* argument);

using ThreadCreation = int(pthread_t*, const pthread_attr_t*, void* (*)(void*), void*);

/// The pthread_create that one of this program's stands before.
inline ThreadCreation* nextThreadCreation() {
    return __interceptor_pthread_create != nullptr ? &__interceptor_pthread_create
                                                   : nextFunction<ThreadCreation>("pthread_create");
}
