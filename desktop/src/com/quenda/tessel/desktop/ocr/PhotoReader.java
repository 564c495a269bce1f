package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.ocr.TsvPages.Word;
import java.util.ArrayList;
import java.util.Comparator;
import java.util.List;
import java.util.Locale;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * Reads the text lines of a photograph: finds them first (the recogniser's own page layout fails
 * on tilted lines and busy photographs), then straightens each line and has the {@code tesseract}
 * program read all of them as single lines in one run.
 *
 * <p>Orientation, two cheap rules. Per line: a line not read, or read with a confidence under
 * {@link #SURE_CONFIDENCE}, is read again turned by 180° in one more run for all such lines, and
 * the surer reading kept (an upside-down page or sign). Per picture: the line finder only looks
 * for rows within 40° of horizontal, so before reading, the candidates are also linked as if the
 * picture were transposed; when far more of them stand in columns than in rows, the picture is
 * held sideways, the recogniser's orientation detection (page segmentation mode 0) says which way
 * to turn it, and the turned picture is read (if it cannot tell, a quarter turn clockwise, and the
 * per-line rule catches the lines that end up upside down). A line's angle then gives its reading
 * direction: about 90 for text running down, about 180 for text upside down.
 */
public final class PhotoReader implements AutoCloseable {
  public static final long DEFAULT_TIMEOUT_MILLIS = 60_000;
  /** Detection runs on at most this many pixels across; strips are cut at full resolution. */
  static final int DETECTION_SIZE = 1600;
  /** Lines read with less confidence are also read turned by 180°. */
  static final double SURE_CONFIDENCE = 80;

  private final TesseractProgram program;
  private final StripRecognizer recognizer;
  private final boolean canDetectOrientation;

  public PhotoReader(String tesseractLanguage) throws HostException {
    this(tesseractLanguage, TesseractProgram.PROGRAM, DEFAULT_TIMEOUT_MILLIS);
  }

  /** With another program or time limit per run of it (tests stand in a hanging program). */
  PhotoReader(String tesseractLanguage, String programPath, long timeoutMillis)
      throws HostException {
    program = new TesseractProgram(programPath, timeoutMillis);
    List<String> installed = program.languages();
    for (String lang : tesseractLanguage.split("\\+")) {
      if (!installed.contains(lang)) {
        throw new HostException(ExitStatus.MISSING_OCR_DATA,
            "no OCR data for language '" + lang + "': install the Debian package "
                + debianPackage(lang));
      }
    }
    recognizer = new StripRecognizer(program, tesseractLanguage);
    canDetectOrientation = installed.contains("osd");
  }

  /** tesseract-ocr-chi-sim for chi_sim. */
  static String debianPackage(String lang) {
    return "tesseract-ocr-" + lang.replace('_', '-').toLowerCase(Locale.ROOT);
  }

  /** The text lines of an 8-bit RGB picture, top to bottom. */
  public List<RecognizedLine> read(Mat rgb) throws HostException {
    if (rgb.empty() || rgb.type() != CvType.CV_8UC3) {
      throw new HostException(
          ExitStatus.INTERNAL, "OCR needs a non-empty 8-bit RGB picture, got " + rgb);
    }
    Mat grey = new Mat();
    Imgproc.cvtColor(rgb, grey, Imgproc.COLOR_RGB2GRAY);
    try {
      return sorted(wholeLines(readGrey(grey, true), rgb.size()));
    } finally {
      grey.release();
    }
  }

  @Override
  public void close() {}

  /**
   * Without the lines that run off the picture: where a line's rectangle reaches past the edge its
   * text is cut, and what is left in view ("ts sold he") is neither the sign's text nor anything
   * to translate.
   */
  private static List<RecognizedLine> wholeLines(List<RecognizedLine> lines, Size picture) {
    List<RecognizedLine> whole = new ArrayList<>();
    Point[] corners = new Point[4];
    for (RecognizedLine line : lines) {
      line.rect.points(corners);
      boolean cut = false;
      for (Point p : corners) {
        cut |= p.x < 0 || p.y < 0 || p.x > picture.width || p.y > picture.height;
      }
      if (!cut) {
        whole.add(line);
      }
    }
    return whole;
  }

  private List<RecognizedLine> readGrey(Mat grey, boolean mayTurn) throws HostException {
    double f = Math.min(1.0, DETECTION_SIZE / (double) Math.max(grey.cols(), grey.rows()));
    Mat small = grey;
    if (f < 1) {
      small = new Mat();
      Imgproc.resize(grey, small, new Size(), f, f, Imgproc.INTER_AREA);
    }
    List<Component> components = new CharacterDetector((int) small.total()).detect(small);
    if (small != grey) {
      small.release();
    }
    try {
      if (mayTurn && sideways(components)) {
        int turn = canDetectOrientation ? PageOrientation.clockwiseTurn(program, grey) : 0;
        turn = turn == 270 ? 270 : 90; // if unsure, lines upside down are turned line by line
        Mat turned = PageOrientation.turn(grey, turn);
        try {
          return turnBack(readGrey(turned, false), turn, grey.cols(), grey.rows());
        } finally {
          turned.release();
        }
      }
      return readRows(grey, new LineGrouper().group(components), f);
    } finally {
      for (Component c : components) {
        c.points.release();
      }
    }
  }

  /** Reads the rows found at detection scale {@code f}, unsure ones also upside down. */
  private List<RecognizedLine> readRows(Mat grey, List<TextLine> lines, double f)
      throws HostException {
    List<RotatedRect> rects = new ArrayList<>();
    for (TextLine l : lines) {
      RotatedRect r = new RotatedRect(new Point(l.rect.center.x / f, l.rect.center.y / f),
          new Size(l.rect.size.width / f, l.rect.size.height / f), l.rect.angle);
      rects.add(TrailingMarks.widen(grey, r, l.bright));
    }
    List<List<Word>> words = recognise(grey, lines, rects, false);
    RecognizedLine[] best = new RecognizedLine[lines.size()];
    List<Integer> retry = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      TextFilter.Reading r = TextFilter.accept(words.get(i));
      if (r != null) {
        best[i] = result(lines.get(i), rects.get(i), r, false, f);
      }
      if (r == null || r.confidence() < SURE_CONFIDENCE) {
        retry.add(i);
      }
    }
    List<TextLine> retryLines = new ArrayList<>();
    List<RotatedRect> retryRects = new ArrayList<>();
    for (int i : retry) {
      retryLines.add(lines.get(i));
      retryRects.add(rects.get(i));
    }
    List<List<Word>> turned = recognise(grey, retryLines, retryRects, true);
    for (int k = 0; k < retry.size(); k++) {
      int i = retry.get(k);
      TextFilter.Reading r = TextFilter.accept(turned.get(k));
      if (r != null && (best[i] == null || r.confidence() > best[i].confidence)) {
        best[i] = result(retryLines.get(k), retryRects.get(k), r, true, f);
      }
    }
    List<RecognizedLine> out = new ArrayList<>();
    for (RecognizedLine l : best) {
      if (l != null) {
        out.add(l);
      }
    }
    return out;
  }

  /**
   * A picture held sideways: at least 30 candidates stand in vertical rows, and more than twice as
   * many as in horizontal ones.
   */
  private static boolean sideways(List<Component> components) {
    List<Component> transposed = new ArrayList<>();
    for (Component c : components) {
      transposed.add(c.transposed());
    }
    int across = LineGrouper.candidatesInRows(components);
    int down = LineGrouper.candidatesInRows(transposed);
    return down >= 30 && down > 2 * across;
  }

  /**
   * The line as read. When the words kept span less than the line (a fragment of a plate's edge
   * or texture joined the row but was not read as text), the rectangle is remade from the
   * candidates under the words.
   */
  private static RecognizedLine result(
      TextLine line, RotatedRect rect, TextFilter.Reading reading, boolean upsideDown, double f) {
    double from = Double.MAX_VALUE;
    double to = -Double.MAX_VALUE;
    for (Word w : reading.words()) {
      double a = LineRectifier.alongLine(rect, w.left(), upsideDown);
      double b = LineRectifier.alongLine(rect, w.left() + w.width(), upsideDown);
      from = Math.min(from, Math.min(a, b));
      to = Math.max(to, Math.max(a, b));
    }
    double slack = 0.3 * rect.size.height;
    RotatedRect r = rect;
    if (from > -rect.size.width / 2 + slack || to < rect.size.width / 2 - slack) {
      double t = Math.toRadians(line.rect.angle);
      List<Component> under = new ArrayList<>();
      for (Component c : line.parts) {
        double u = ((c.cx() - line.rect.center.x) * Math.cos(t)
                       + (c.cy() - line.rect.center.y) * Math.sin(t))
            / f;
        if (u >= from - slack && u <= to + slack) {
          under.add(c);
        }
      }
      RotatedRect ink = under.isEmpty() ? null : InkRect.of(under, line.rect.angle);
      if (ink != null && under.size() < line.parts.size()) {
        r = new RotatedRect(new Point(ink.center.x / f, ink.center.y / f),
            new Size(ink.size.width / f, ink.size.height / f), ink.angle);
      }
    }
    double angle = upsideDown ? reverse(r.angle) : r.angle;
    return new RecognizedLine(
        reading.text(), new RotatedRect(r.center, r.size, angle), reading.confidence());
  }

  private List<List<Word>> recognise(Mat grey, List<TextLine> lines, List<RotatedRect> rects,
      boolean upsideDown) throws HostException {
    List<Mat> strips = new ArrayList<>();
    for (int i = 0; i < lines.size(); i++) {
      strips.add(LineRectifier.strip(grey, rects.get(i), lines.get(i).bright, upsideDown));
    }
    try {
      return recognizer.read(strips);
    } finally {
      for (Mat s : strips) {
        s.release();
      }
    }
  }

  /** The angle of the same line read the other way, in (-180, 180]. */
  static double reverse(double angle) {
    double a = angle + 180;
    return a > 180 ? a - 360 : a;
  }

  /**
   * Lines read in a picture turned clockwise by {@code turn}, brought back to the original
   * picture of {@code width}×{@code height}.
   */
  static List<RecognizedLine> turnBack(
      List<RecognizedLine> lines, int turn, int width, int height) {
    List<RecognizedLine> out = new ArrayList<>();
    for (RecognizedLine l : lines) {
      double x = l.rect.center.x;
      double y = l.rect.center.y;
      Point c;
      switch (turn) {
        case 90: // (x, y) went to (height - 1 - y, x)
          c = new Point(y, height - 1 - x);
          break;
        case 180:
          c = new Point(width - 1 - x, height - 1 - y);
          break;
        default: // 270: (x, y) went to (y, width - 1 - x)
          c = new Point(width - 1 - y, x);
      }
      double a = l.rect.angle - turn;
      while (a <= -180) {
        a += 360;
      }
      out.add(new RecognizedLine(l.text, new RotatedRect(c, l.rect.size, a), l.confidence));
    }
    return out;
  }

  private static List<RecognizedLine> sorted(List<RecognizedLine> lines) {
    lines.sort(Comparator.comparingDouble((RecognizedLine l) -> l.rect.center.y)
                   .thenComparingDouble(l -> l.rect.center.x));
    return lines;
  }
}
