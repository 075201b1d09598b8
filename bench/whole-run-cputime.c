/*
 * Part of bench/whole-run: runs a command and writes the cpu time of its
 * whole process tree (user + system, in microseconds, every descendant that
 * was waited for included) to a file. Exits with the command's exit status.
 *
 * Usage: whole-run-cputime RESULT-FILE COMMAND [ARGUMENT ...]
 */
#include <stdio.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

static long long microseconds(struct timeval time) {
    return (long long)time.tv_sec * 1000000 + time.tv_usec;
}

int main(int argc, char **argv) {
    struct rusage usage;
    int status = 0;
    pid_t child;
    FILE *result;
    if (argc < 3) {
        fprintf(stderr, "usage: %s RESULT-FILE COMMAND [ARGUMENT ...]\n", argv[0]);
        return 2;
    }
    child = fork();
    if (child < 0) {
        perror("fork");
        return 1;
    }
    if (child == 0) {
        execv(argv[2], argv + 2);
        perror(argv[2]);
        _exit(127);
    }
    if (wait4(child, &status, 0, &usage) != child) {
        perror("wait4");
        return 1;
    }
    result = fopen(argv[1], "w");
    if (result == NULL) {
        perror(argv[1]);
        return 1;
    }
    fprintf(result, "%lld\n", microseconds(usage.ru_utime) + microseconds(usage.ru_stime));
    fclose(result);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 1;
}
