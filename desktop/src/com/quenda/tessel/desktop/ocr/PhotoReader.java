package com.quenda.tessel.desktop.ocr;

import com.quenda.tessel.desktop.ExitStatus;
import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.ocr.TsvPages.Word;
import java.nio.file.Path;
import java.util.ArrayList;
import java.util.List;
import java.util.Locale;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.imgproc.Imgproc;

/**
 * Reads the text lines of a photograph with the learned text reader: it finds the lines (at any
 * angle, upside down included) and, for English and Chinese, reads them too. The recognisers know
 * English letters and Chinese characters but not the accented letters of other languages (ñ, ç,
 * ß, ö, ...): for those the reader's lines are still used, and each line, cut out upright, is read
 * by the {@code tesseract} program with that language's data, all lines of a picture in one run.
 *
 * <p>Every line says which recogniser read it: {@link #LATIN}, {@link #CHINESE} or {@link
 * #TESSERACT}.
 */
public final class PhotoReader implements AutoCloseable {
  public static final long DEFAULT_TIMEOUT_MILLIS = 60_000;
  public static final String LATIN = "learned-latin";
  public static final String CHINESE = "learned-chinese";
  public static final String TESSERACT = "tesseract";
  /**
   * The detector sees the picture scaled to this long side: large enough for the small print of a
   * page or a receipt, small enough that a sign's letters are not cut into pieces.
   */
  static final int DETECTION_LONG_SIDE = 960;
  /**
   * A picture smaller than that holds text that is small in pixels (a scanned page, a thumbnail):
   * the detector sees it enlarged further, since it misses letters under about 8 px high.
   */
  static final int SMALL_PICTURE_DETECTION_LONG_SIDE = 1280;
  /**
   * Line crops for Tesseract are this high: the detector's box holds the letters with a margin, so
   * their capitals come out some 30 px high, where Tesseract reads best.
   */
  static final int CROP_HEIGHT = 56;
  /**
   * Learned readings surer than this are kept. On real photographs the recogniser's readings
   * under 0.8 are mostly wrong (texture, or a word half hidden); above it mostly right.
   */
  static final double MIN_CONFIDENCE = 0.8;
  /** A margin of background around each crop, which Tesseract wants around a line. */
  static final int CROP_MARGIN = 8;
  /** As many threads as the machine has cores. */
  public static final int ALL_CORES = 0;

  private final Path modelDir;
  private final int threads;
  /** Whether large pictures are looked at closer first, for a scene's small text. */
  private final boolean sceneDetail;
  private final LearnedReader learned;
  /** For pictures smaller than {@link #DETECTION_LONG_SIDE}; made when first needed. */
  private LearnedReader smallPictures;
  private final String recogniser;
  /** Null when the learned recogniser reads the lines. */
  private final StripRecognizer tesseract;

  /** A reader for text in the language Tesseract calls {@code tesseractLanguage}, on one thread. */
  public PhotoReader(String tesseractLanguage) throws HostException {
    this(tesseractLanguage, 1);
  }

  /**
   * With {@code threads} threads for the networks ({@link #ALL_CORES}: one per core): photos are
   * read on all cores, a live video's keyframes on one, beside the frames being drawn.
   */
  public PhotoReader(String tesseractLanguage, int threads) throws HostException {
    this(tesseractLanguage, null, TesseractProgram.PROGRAM, DEFAULT_TIMEOUT_MILLIS, threads, true);
  }

  /**
   * A reader for a live video's keyframes: on one thread, beside the frames being drawn, and
   * looking at each frame once at {@link #DETECTION_LONG_SIDE}. The closer look for a scene's small
   * text doubles the detector's time on a 720p frame, and the live overlay waits for it.
   */
  public static PhotoReader forLiveVideo(String tesseractLanguage) throws HostException {
    return new PhotoReader(
        tesseractLanguage, null, TesseractProgram.PROGRAM, DEFAULT_TIMEOUT_MILLIS, 1, false);
  }

  /**
   * With another model folder (null: the one the launcher names), or another program or time
   * limit per run of it (tests stand in a hanging program).
   */
  PhotoReader(String tesseractLanguage, Path modelDir, String programPath, long timeoutMillis)
      throws HostException {
    this(tesseractLanguage, modelDir, programPath, timeoutMillis, 1, true);
  }

  private PhotoReader(String tesseractLanguage, Path modelDir, String programPath,
      long timeoutMillis, int threads, boolean sceneDetail) throws HostException {
    this.threads = threads;
    this.sceneDetail = sceneDetail;
    switch (tesseractLanguage) {
      case "eng":
        recogniser = LATIN;
        tesseract = null;
        break;
      case "chi_sim":
        recogniser = CHINESE;
        tesseract = null;
        break;
      default:
        recogniser = TESSERACT;
        tesseract = tesseractFor(tesseractLanguage, programPath, timeoutMillis);
    }
    this.modelDir = modelDir != null ? modelDir : LearnedReader.modelDir();
    learned = open(DETECTION_LONG_SIDE);
  }

  private LearnedReader open(int detectionLongSide) throws HostException {
    return new LearnedReader(modelDir,
        recogniser.equals(CHINESE) ? LearnedReader.Script.CHINESE : LearnedReader.Script.LATIN,
        detectionLongSide, sceneDetail ? LearnedReader.SCENE_LONG_SIDE : 0, tesseract == null,
        threads);
  }

  private LearnedReader readerFor(Mat rgb) throws HostException {
    if (Math.max(rgb.cols(), rgb.rows()) >= DETECTION_LONG_SIDE) {
      return learned;
    }
    if (smallPictures == null) {
      smallPictures = open(SMALL_PICTURE_DETECTION_LONG_SIDE);
    }
    return smallPictures;
  }

  private static StripRecognizer tesseractFor(
      String tesseractLanguage, String programPath, long timeoutMillis) throws HostException {
    TesseractProgram program = new TesseractProgram(programPath, timeoutMillis);
    List<String> installed = program.languages();
    for (String lang : tesseractLanguage.split("\\+")) {
      if (!installed.contains(lang)) {
        throw new HostException(ExitStatus.MISSING_OCR_DATA,
            "no OCR data for language '" + lang + "': install the Debian package "
                + debianPackage(lang));
      }
    }
    return new StripRecognizer(program, tesseractLanguage);
  }

  /** tesseract-ocr-chi-sim for chi_sim. */
  static String debianPackage(String lang) {
    return "tesseract-ocr-" + lang.replace('_', '-').toLowerCase(Locale.ROOT);
  }

  /** Which recogniser reads the lines: {@link #LATIN}, {@link #CHINESE} or {@link #TESSERACT}. */
  public String recogniser() {
    return recogniser;
  }

  /** The text lines of an 8-bit RGB picture, in reading order. */
  public synchronized List<RecognizedLine> read(Mat rgb) throws HostException {
    if (rgb.empty() || rgb.type() != CvType.CV_8UC3) {
      throw new HostException(
          ExitStatus.INTERNAL, "OCR needs a non-empty 8-bit RGB picture, got " + rgb);
    }
    List<LearnedReader.Line> found;
    try {
      found = readerFor(rgb).read(rgb);
    } catch (RuntimeException e) {
      throw new HostException(ExitStatus.INTERNAL, "the text reader failed: " + e.getMessage(), e);
    }
    return tesseract == null ? kept(found) : readWithTesseract(rgb, found);
  }

  @Override
  public synchronized void close() {
    learned.close();
    if (smallPictures != null) {
      smallPictures.close();
    }
  }

  /** The learned reader's own readings, without those that are not text. */
  private List<RecognizedLine> kept(List<LearnedReader.Line> found) {
    List<RecognizedLine> out = new ArrayList<>();
    for (LearnedReader.Line line : found) {
      if (worthTranslating(line.text(), line.confidence())) {
        out.add(new RecognizedLine(line.text(), line.rect(), 100 * line.confidence(), recogniser));
      }
    }
    return out;
  }

  /** Whether a learned reading (confidence 0..1) is sure enough and looks like text. */
  static boolean worthTranslating(String text, double confidence) {
    return confidence >= MIN_CONFIDENCE && looksLikeText(text);
  }

  /**
   * Whether a reading is worth translating: two letters or digits at least, and mostly letters or
   * digits. Texture, a pole or a plate's edge that the detector takes for text reads as a symbol
   * or two ("|", "-:"), which is nothing to translate and erasing it would damage the picture.
   */
  static boolean looksLikeText(String text) {
    int alnum = 0;
    int other = 0;
    for (int i = 0; i < text.length(); i = text.offsetByCodePoints(i, 1)) {
      int c = text.codePointAt(i);
      if (Character.isLetterOrDigit(c)) {
        alnum++;
      } else if (!Character.isWhitespace(c)) {
        other++;
      }
    }
    return alnum >= 2 && alnum >= 2 * other;
  }

  /** Each line cut out upright and read by Tesseract; lines it reads as no text are dropped. */
  private List<RecognizedLine> readWithTesseract(Mat rgb, List<LearnedReader.Line> found)
      throws HostException {
    List<Mat> crops = new ArrayList<>();
    try {
      for (LearnedReader.Line line : found) {
        crops.add(darkOnLight(LearnedReader.uprightCrop(rgb, line.rect(), CROP_HEIGHT)));
      }
      List<List<Word>> words = tesseract.read(crops);
      List<RecognizedLine> out = new ArrayList<>();
      for (int i = 0; i < found.size(); i++) {
        TextFilter.Reading reading = TextFilter.accept(words.get(i));
        if (reading != null) {
          out.add(new RecognizedLine(
              reading.text(), found.get(i).rect(), reading.confidence(), TESSERACT));
        }
      }
      return out;
    } finally {
      for (Mat crop : crops) {
        crop.release();
      }
    }
  }

  /**
   * The crop in grey, dark letters on a light ground with a margin of ground around it: Tesseract
   * reads dark on light best, and its own second try in negative is turned off. The ground is what
   * the crop's edge shows (the box holds the letters with a margin); when it is darker than Otsu's
   * threshold the letters are light and the crop is inverted.
   */
  static Mat darkOnLight(Mat rgbCrop) {
    Mat grey = new Mat();
    Imgproc.cvtColor(rgbCrop, grey, Imgproc.COLOR_RGB2GRAY);
    rgbCrop.release();
    Mat ink = new Mat();
    double threshold = Imgproc.threshold(grey, ink, 0, 255, Imgproc.THRESH_OTSU);
    ink.release();
    if (edgeMean(grey) < threshold) {
      Core.bitwise_not(grey, grey);
    }
    Mat out = new Mat();
    Core.copyMakeBorder(
        grey, out, CROP_MARGIN, CROP_MARGIN, CROP_MARGIN, CROP_MARGIN, Core.BORDER_REPLICATE);
    grey.release();
    return out;
  }

  /** The mean of the outermost rows and columns of a grey image. */
  private static double edgeMean(Mat grey) {
    int w = grey.cols();
    int h = grey.rows();
    double sum = 0;
    for (Mat edge : List.of(grey.row(0), grey.row(h - 1), grey.col(0), grey.col(w - 1))) {
      sum += Core.sumElems(edge).val[0];
      edge.release(); // a header on the crop's pixels, freed now rather than by the collector
    }
    return sum / (2.0 * w + 2.0 * h);
  }
}
