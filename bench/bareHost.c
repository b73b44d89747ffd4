/* A host that has nothing but the plug-in, for hostFootprint.cpp.
 *   bare_host LIBRARY [CONFIGURATION]
 * prints how long loading takes, in nanoseconds. With the text of a configuration it also runs a
 * session until there are ten pairs, and prints by how much its memory has grown since before the
 * load, thread stacks left out: resident, and private and written to, in KiB. */
#define _GNU_SOURCE
#include <dlfcn.h>
#include <pthread.h>
#include <stdatomic.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <time.h>

#include <vantel_bc/zekel.h>
#include <vantel_bc/zekeltr.h>

enum { PAIRS = 10, PATIENCE_MS = 30000 };

static atomic_int pairs;

static uint64_t now(clockid_t clock) {
    struct timespec time;
    clock_gettime(clock, &time);
    return (uint64_t)time.tv_sec * 1000000000U + (uint64_t)time.tv_nsec;
}

void zekel_getTime(void** context, uint64_t* time, zeerr_Status* status) {
    (void)context;
    (void)status;
    *time = now(CLOCK_REALTIME);
}

void zekel_adjustTime(void** context, uint64_t reference, uint64_t local, zeerr_Status* status) {
    (void)context;
    (void)reference;
    (void)local;
    (void)status;
    ++pairs;
}

void zekel_setTRQuality(void** context, const double* quality, const char* reason,
                        zeerr_Status* status) {
    (void)context;
    (void)quality;
    (void)reason;
    (void)status;
}

void zekel_updateMetaData(void** context, const char* json, zeerr_Status* status) {
    (void)context;
    (void)json;
    (void)status;
}

/* What a host in this language has used anyway. */
void use_language(void);

struct memory {
    long resident;
    long written;
};

/* A thread's stack is a mapping of the size that stacks have by default. */
static struct memory memory_without_stacks(void) {
    struct memory all = {0, 0};
    pthread_attr_t attributes;
    size_t stack = 0;
    char line[4096];
    long value = 0;
    int is_stack = 0;
    FILE* file = fopen("/proc/self/smaps", "r");

    pthread_getattr_default_np(&attributes);
    pthread_attr_getstacksize(&attributes, &stack);
    while (file && fgets(line, sizeof(line), file)) {
        if (sscanf(line, "Size: %ld kB", &value) == 1)
            is_stack = value == (long)(stack / 1024);
        else if (!is_stack && sscanf(line, "Rss: %ld kB", &value) == 1)
            all.resident += value;
        else if (!is_stack && sscanf(line, "Private_Dirty: %ld kB", &value) == 1)
            all.written += value;
    }
    if (file)
        fclose(file);
    return all;
}

static void* find(void* library, const char* name) {
    void* symbol = dlsym(library, name);
    if (!symbol) {
        fprintf(stderr, "bare_host: %s\n", dlerror());
        exit(1);
    }
    return symbol;
}

static void wait_for_pairs(void) {
    const struct timespec pause = {0, 1000000};
    int left = PATIENCE_MS;
    while (pairs < PAIRS && left-- > 0)
        nanosleep(&pause, NULL);
}

/* By how much the memory has grown is looked at while the session runs. */
static struct memory memory_with_session(void* library, const char* configuration) {
    void* slot = NULL;
    zeerr_Status status = {0, 0, NULL, NULL};
    void (*initialize)(void**, const char*, zeerr_Status*);
    void (*start)(void**, zeerr_Status*);
    void (*end)(void**);
    struct memory memory;

    *(void**)&initialize = find(library, "zekeltr_initialize");
    *(void**)&start = find(library, "zekeltr_start");
    initialize(&slot, configuration, &status);
    start(&slot, &status);
    if (status.code < 0) {
        fprintf(stderr, "bare_host: status %d\n", (int)status.code);
        exit(1);
    }
    wait_for_pairs();
    memory = memory_without_stacks();
    *(void**)&end = find(library, "zekeltr_stop");
    end(&slot);
    *(void**)&end = find(library, "zekeltr_finalize");
    end(&slot);
    if (pairs < PAIRS) {
        fprintf(stderr, "bare_host: the pairs do not come\n");
        exit(1);
    }
    return memory;
}

int main(int argc, char** argv) {
    struct memory before;
    struct memory after;
    uint64_t start;
    uint64_t loaded;
    void* library;

    if (argc < 2)
        return 2;
    use_language();
    before = memory_without_stacks();
    start = now(CLOCK_MONOTONIC);
    library = dlopen(argv[1], RTLD_NOW);
    loaded = now(CLOCK_MONOTONIC);
    if (!library) {
        fprintf(stderr, "bare_host: %s\n", dlerror());
        return 1;
    }
    printf("%llu", (unsigned long long)(loaded - start));
    if (argc > 2) {
        after = memory_with_session(library, argv[2]);
        printf(" %ld %ld", after.resident - before.resident, after.written - before.written);
    }
    printf("\n");
    return 0;
}
