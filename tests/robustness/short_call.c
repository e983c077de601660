/* short_call CALL N PROGRAM ARGUMENT...: runs a program whose N-th read or write ("read", "write") is of half
 * the bytes that it asks for, as the system is free to do. Exits as the program does. For the kill sweep;
 * 64-bit x86 Linux. */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/ptrace.h>
#include <sys/syscall.h>
#include <sys/user.h>
#include <sys/wait.h>
#include <unistd.h>

static long stop(pid_t child, int* status) {
  return ptrace(PTRACE_SYSCALL, child, 0, 0) == 0 && waitpid(child, status, 0) == child;
}

int main(int argc, char** argv) {
  if (argc < 4) return 2;
  const unsigned long long call = strcmp(argv[1], "write") == 0 ? SYS_write : SYS_read;
  const int wanted = atoi(argv[2]);
  int seen = 0, status, is_entry = 1;

  const pid_t child = fork();
  if (child == 0) {
    ptrace(PTRACE_TRACEME, 0, 0, 0);
    execv(argv[3], argv + 3);
    _exit(127);
  }
  if (child < 0 || waitpid(child, &status, 0) != child) return 2;
  for (; !WIFEXITED(status) && !WIFSIGNALED(status) && stop(child, &status); is_entry = !is_entry) {
    struct user_regs_struct regs;
    if (!WIFSTOPPED(status) || !is_entry || ptrace(PTRACE_GETREGS, child, 0, &regs) != 0) continue;
    if (regs.orig_rax != call || ++seen != wanted) continue;
    if (regs.rdx > 1) regs.rdx /= 2;
    ptrace(PTRACE_SETREGS, child, 0, &regs);
  }
  return WIFEXITED(status) ? WEXITSTATUS(status) : 3;
}
