// Interruption of child processes.
#ifndef KESTREL_HOST_PORT_INTERRUPT_H
#define KESTREL_HOST_PORT_INTERRUPT_H

/// Interrupts what Port_Process::Run waits for, on behalf of a signal handler or another thread.
///
/// Nothing here happens on its own: a process that never calls Request is never interrupted, and
/// its children stay in its process group, where the signals of a terminal reach both.
class Port_Interrupt {
 public:
  /// Passes the signal on to the running child, from the second call on kills it, and lets no
  /// other child start. Run waits for the child as ever. Lasts until Clear. The same signal again
  /// within a tenth of a second counts once. May be called from a signal handler and from any
  /// thread; leaves errno alone.
  static void Request(int signal);
  /// The signal of the first Request since the start of the process or since Clear; 0 for none.
  static int Requested();
  /// Children may start again. Not to be called while one runs.
  static void Clear();

  /// true: children that start from now on lead process groups of their own. Signals of the
  /// terminal then reach them through this class only, which passes them on to all that a child
  /// has started in its group; once an interrupted child has ended, what still lives of its group
  /// is given a second, then killed. false, as at the start: children belong to the group of this
  /// process, and only the child itself is interrupted.
  static void SetOwnGroups(bool own);
  /// Sends a signal to the running child, or its group, and nothing more. For SIGTSTP and SIGCONT.
  /// May be called from a signal handler and from any thread; leaves errno alone.
  static void PassOn(int signal);
};

#endif
