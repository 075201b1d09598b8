/*
 * Part of bench/whole-run: preloaded into the survey tool, it writes the
 * process's own peak resident memory (VmHWM, in kilobytes) to the file named
 * by QUORVEX_PEAK_MEMORY_FILE when the process exits. Written in C so that
 * it brings no library of its own into the measured process; the shells and
 * console tools the survey starts do not inherit it.
 */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

static long peak_kilobytes(void) {
    char line[256];
    long peak = 0;
    FILE *status = fopen("/proc/self/status", "r");
    if (status == NULL) {
        return 0;
    }
    while (fgets(line, sizeof line, status) != NULL) {
        if (strncmp(line, "VmHWM:", 6) == 0) {
            peak = strtol(line + 6, NULL, 10);
            break;
        }
    }
    fclose(status);
    return peak;
}

__attribute__((constructor)) static void keep_from_children(void) {
    unsetenv("LD_PRELOAD");
}

__attribute__((destructor)) static void write_peak_memory(void) {
    const char *path = getenv("QUORVEX_PEAK_MEMORY_FILE");
    FILE *result;
    if (path == NULL || (result = fopen(path, "w")) == NULL) {
        return;
    }
    fprintf(result, "%ld\n", peak_kilobytes());
    fclose(result);
}
