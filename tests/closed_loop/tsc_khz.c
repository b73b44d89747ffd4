/* Prints how fast this machine's time stamp counter is, in kHz of its own CLOCK_REALTIME, to about
 * 0.1 ppm. */
#include <stdio.h>
#include <time.h>
#include <x86intrin.h>

struct reading {
    double seconds;
    unsigned long long ticks;
};

/* The one of several in which reading the clock took the fewest ticks. */
static struct reading readBoth(void) {
    struct reading best = {0, 0};
    unsigned long long shortest = ~0ULL;
    for (int i = 0; i < 1000; ++i) {
        struct timespec now;
        const unsigned long long before = __rdtsc();
        clock_gettime(CLOCK_REALTIME, &now);
        const unsigned long long took = __rdtsc() - before;
        if (took < shortest) {
            shortest = took;
            best.seconds = (double)(now.tv_sec % 100000) + (double)now.tv_nsec / 1e9;
            best.ticks = before + took / 2;
        }
    }
    return best;
}

int main(void) {
    const struct timespec pause = {2, 0};
    const struct reading first = readBoth();
    nanosleep(&pause, NULL);
    const struct reading second = readBoth();
    printf("%.0f\n", (double)(second.ticks - first.ticks) / (second.seconds - first.seconds) / 1e3);
    return 0;
}
