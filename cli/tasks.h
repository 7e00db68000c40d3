// What the command can do: a function for each task. Each returns the exit status.
#ifndef KESTREL_CLI_TASKS_H
#define KESTREL_CLI_TASKS_H

#include "cli/settings.h"

enum exit_status { ALL_FOUND = 0, NOT_ALL_FOUND = 1, FAILED = 2 };

int resolve(const settings& set);
int explain(const settings& set);
int check(const settings& set);
int list_rules(const settings& set);
int draw_graph(const settings& set);
int list_parts(const settings& set);
int print_completion(const settings& set);
int print_help(const settings& set);
int print_version(const settings& set);

#endif
