/* Loads the installed plug-in by its name, and shows its API version, name, and parameter schema.
 */
#include <dlfcn.h>
#include <stdio.h>
#include <stdlib.h>
#include <vantel_bc/zekel.h>
#include <vantel_bc/zekeltr.h>

#define CALL(type, function) ((type)dlsym(library, #function))
typedef void (*GetName)(char*);
typedef uint32_t (*GetVersion)(void);
typedef void (*GetSchema)(zekeltr_Reallocate, char**, zeerr_Status*);

/* The plug-in cannot be loaded without these. None is called here. */
void zekel_getTime(void** context, uint64_t* now, zeerr_Status* status) {
    abort();
}
void zekel_adjustTime(void** context, uint64_t reference, uint64_t local, zeerr_Status* status) {
    abort();
}
void zekel_setTRQuality(void** context, const double* quality, const char* reason,
                        zeerr_Status* status) {
    abort();
}
void zekel_updateMetaData(void** context, const char* json, zeerr_Status* status) {
    abort();
}

static char* reallocate(char* buffer, size_t size) {
    return realloc(buffer, size);
}

int main(void) {
    char name[ZEKELTR_NAME_SIZE], *schema = NULL;
    zeerr_Status status = {0, 0, NULL, NULL};
    void* library = dlopen("libvantel_bc.so.19", RTLD_NOW);
    if (!library)
        return fprintf(stderr, "%s\n", dlerror()), 1;
    CALL(GetName, zekeltr_getName)(name);
    CALL(GetSchema, zekeltr_getParameterValidationData)(reallocate, &schema, &status);
    return printf("%u\n%s\n%s\n", CALL(GetVersion, zekeltr_getAPIVersion)(), name, schema) < 0;
}
