package com.quenda.tessel.desktop;

/**
 * A failure the user can act on: its message is the one line printed on standard error, and its
 * status is the process's exit status.
 */
public final class HostException extends Exception {
  private static final long serialVersionUID = 1L;

  public final ExitStatus status;

  public HostException(ExitStatus status, String message) {
    super(message);
    this.status = status;
  }

  public HostException(ExitStatus status, String message, Throwable cause) {
    super(message, cause);
    this.status = status;
  }
}
