/* The least a reader of a field book must do, as a plain C program: every
 * line fetched with getline, cut into words at blanks, every word converted
 * with strtod. The benchmark runs it beside `carnet check` on the same file,
 * both as whole processes. */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

int main(int argc, char** argv) {
    if (argc != 2) {
        fprintf(stderr, "usage: %s FILE\n", argv[0]);
        return 2;
    }
    FILE* f = fopen(argv[1], "r");
    if (!f) {
        perror(argv[1]);
        return 2;
    }
    char* line = NULL;
    size_t cap = 0;
    long lines = 0, words = 0, numbers = 0;
    double sum = 0.0;
    for (ssize_t n; (n = getline(&line, &cap, f)) > 0;) {
        ++lines;
        for (char* word = strtok(line, " \t\r\n"); word; word = strtok(NULL, " \t\r\n")) {
            char* end = NULL;
            const double v = strtod(word, &end);
            ++words;
            if (end != word) {
                ++numbers;
                sum += v;
            }
        }
    }
    free(line);
    fclose(f);
    printf("%s: %ld lines, %ld words, %ld numbers (sum %g)\n", argv[1], lines, words, numbers, sum);
    return 0;
}
