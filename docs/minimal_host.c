/* The smallest host: prints what the plug-in reports for a minute. Create the epoch FIFO first.
 *   cc minimal_host.c -rdynamic -ldl -o minimal_host && ./minimal_host configuration.json
 * For 32 bits, add -D_FILE_OFFSET_BITS=64 -D_TIME_BITS=64: its clock then goes on after 2038. */
#include <dlfcn.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <time.h>
#include <unistd.h>

#include <vantel_bc/zekel.h>
#include <vantel_bc/zekeltr.h>

/* What the plug-in calls. */

void zekel_getTime(void** context, uint64_t* now, zeerr_Status* status) {
    struct timespec time;
    (void)context;
    (void)status;
    clock_gettime(CLOCK_REALTIME, &time);
    *now = (uint64_t)time.tv_sec * 1000000000U + (uint64_t)time.tv_nsec;
}

void zekel_adjustTime(void** context, uint64_t reference, uint64_t local, zeerr_Status* status) {
    (void)context;
    (void)status;
    printf("offset %lld ns\n", (long long)(local - reference));
}

void zekel_setTRQuality(void** context, const double* quality, const char* reason,
                        zeerr_Status* status) {
    (void)context;
    (void)status;
    printf("%s: %s\n", quality[0] > 0 ? "usable" : "unusable", reason);
}

void zekel_updateMetaData(void** context, const char* json, zeerr_Status* status) {
    (void)context;
    (void)status;
    printf("%s\n", json);
}

/* Where the text of an error goes. */

static bool resize(zeerr_Status* status, uint32_t size) {
    char* text = NULL;
    if (size != 0 && size <= status->capacity)
        return true;
    if (size != 0) {
        text = malloc(size);
        if (!text)
            return false;
        strcpy(text, status->json ? status->json : "{}");
    }
    free(status->json);
    status->json = text;
    status->capacity = size;
    return true;
}

static int failed(const char* operation, zeerr_Status* status) {
    if (status->code >= 0)
        return 0;
    fprintf(stderr, "%s: %d %s\n", operation, (int)status->code, status->json ? status->json : "");
    status->resize(status, 0);
    return 1;
}

int main(int argc, char** argv) {
    static char configuration[65536];
    void* session = NULL; /* its address names the session */
    zeerr_Status status = {0, 0, resize, NULL};
    void (*initialize)(void**, const char*, zeerr_Status*);
    void (*start)(void**, zeerr_Status*);
    void (*stop)(void**);
    void (*finalize)(void**);
    FILE* file = argc == 2 ? fopen(argv[1], "r") : NULL;
    void* library = dlopen("libvantel_bc.so.19", RTLD_NOW);

    if (!file || !library) {
        fprintf(stderr, "%s\n", file ? dlerror() : "usage: minimal_host CONFIGURATION");
        return 2;
    }
    configuration[fread(configuration, 1, sizeof(configuration) - 1, file)] = '\0';
    fclose(file);
    *(void**)&initialize = dlsym(library, "zekeltr_initialize");
    *(void**)&start = dlsym(library, "zekeltr_start");
    *(void**)&stop = dlsym(library, "zekeltr_stop");
    *(void**)&finalize = dlsym(library, "zekeltr_finalize");

    initialize(&session, configuration, &status);
    if (failed("initialize", &status))
        return 1;
    start(&session, &status);
    if (!failed("start", &status))
        sleep(60);
    stop(&session);
    finalize(&session);
    return 0;
}
