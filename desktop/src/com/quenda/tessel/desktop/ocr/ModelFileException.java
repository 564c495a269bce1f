package com.quenda.tessel.desktop.ocr;

/**
 * A model file of the text reader is missing, unreadable or not a model; thrown by the native
 * side with a message that names the file.
 */
public final class ModelFileException extends Exception {
  private static final long serialVersionUID = 1L;

  public ModelFileException(String message) {
    super(message);
  }
}
