package com.quenda.tessel.desktop.photo;

import com.quenda.tessel.desktop.HostException;
import com.quenda.tessel.desktop.Json;
import com.quenda.tessel.desktop.OutputFiles;
import com.quenda.tessel.desktop.typeset.Typesetter;
import java.util.ArrayList;
import java.util.Arrays;
import java.util.LinkedHashMap;
import java.util.List;
import java.util.Map;
import org.opencv.core.Core;
import org.opencv.core.CvType;
import org.opencv.core.Mat;
import org.opencv.core.Scalar;

/** One translated photo: the original, the drawn picture, its lines and its stage times. */
public final class PhotoResult {
  // White gap between the two halves of the before | after picture.
  private static final int GAP = 8;

  public final PhotoInput input;
  public final Mat original;
  public final Mat translated;
  public final List<LineResult> lines;
  public final List<Typesetter.SetBlock> blocks;
  public final StageTimes times;
  public final double totalMillis;

  PhotoResult(PhotoInput input, Mat original, Mat translated, List<LineResult> lines,
      List<Typesetter.SetBlock> blocks, StageTimes times) {
    this.input = input;
    this.original = original;
    this.translated = translated;
    this.lines = lines;
    this.blocks = blocks;
    this.times = times;
    this.totalMillis = times.sinceStart();
  }

  public int translatedCount() {
    return (int) lines.stream().filter(LineResult::translated).count();
  }

  /** Lines that kept their original text. */
  public List<LineResult> untranslated() {
    List<LineResult> kept = new ArrayList<>();
    for (LineResult line : lines) {
      if (!line.translated()) {
        kept.add(line);
      }
    }
    return kept;
  }

  /** NAME.png, NAME.compare.png and NAME.json, all or none. */
  public void write(OutputFiles files) throws HostException {
    files.image(input.name + ".png", translated);
    Mat sheet = beforeAfter();
    files.image(input.name + ".compare.png", sheet);
    sheet.release();
    files.text(input.name + ".json", Json.write(json()));
    files.commit();
  }

  public void release() {
    original.release();
    translated.release();
  }

  Map<String, Object> json() {
    List<Object> lineList = new ArrayList<>();
    for (LineResult line : lines) {
      lineList.add(line.json());
    }
    Map<String, Object> json = new LinkedHashMap<>();
    json.put("lines", lineList);
    json.put("blocks", blocksJson(blocks));
    json.put("timings_ms", times.json(totalMillis));
    return json;
  }

  /** The report's "blocks": per block its lines, source text, translation, alignment and face. */
  public static List<Object> blocksJson(List<Typesetter.SetBlock> blocks) {
    List<Object> blockList = new ArrayList<>();
    for (Typesetter.SetBlock block : blocks) {
      Map<String, Object> b = new LinkedHashMap<>();
      b.put("lines", block.block().lines);
      b.put("source", block.source());
      b.put("translation", block.translation());
      b.put("align", block.block().align.label);
      b.put("face", block.face() == null ? null : block.face().label);
      b.put("fits", block.translation() == null ? null : block.fits());
      blockList.add(b);
    }
    return blockList;
  }

  private Mat beforeAfter() {
    Mat gap = new Mat(original.rows(), GAP, CvType.CV_8UC3, new Scalar(255, 255, 255));
    Mat sheet = new Mat();
    Core.hconcat(Arrays.asList(original, gap, translated), sheet);
    gap.release();
    return sheet;
  }
}
