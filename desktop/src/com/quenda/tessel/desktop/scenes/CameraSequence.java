package com.quenda.tessel.desktop.scenes;

import java.util.ArrayList;
import java.util.List;
import org.opencv.core.Core;
import org.opencv.core.Mat;
import org.opencv.core.Point;
import org.opencv.core.RotatedRect;
import org.opencv.core.Scalar;
import org.opencv.core.Size;
import org.opencv.imgproc.Imgproc;

/**
 * A hand-held camera filming a generated scene: every frame is a view of the scene through a
 * camera at a known pose (centre, zoom, roll), so the true place of every text line is known in
 * every frame. Poses are interpolated smoothly between key poses; where the camera points away
 * from the text, the text leaves the view.
 */
public final class CameraSequence {
  /** Where the camera looks in the scene (pixels), how much it enlarges, how far it is rolled. */
  public record Pose(double x, double y, double zoom, double rollDegrees) {}

  private final Scene scene;
  private final Size frameSize;
  private final List<Pose> keyPoses;
  private final int frameCount;

  /** {@code frameCount} frames passing through {@code keyPoses}, evenly spaced in time. */
  public CameraSequence(Scene scene, Size frameSize, List<Pose> keyPoses, int frameCount) {
    if (keyPoses.size() < 2 || frameCount < 2) {
      throw new IllegalArgumentException("a sequence needs two key poses and two frames");
    }
    this.scene = scene;
    this.frameSize = frameSize;
    this.keyPoses = List.copyOf(keyPoses);
    this.frameCount = frameCount;
  }

  public int frameCount() {
    return frameCount;
  }

  public Size frameSize() {
    return frameSize;
  }

  public Scene scene() {
    return scene;
  }

  /** The camera pose at frame k: smoothstep between the neighbouring key poses. */
  public Pose pose(int k) {
    double t = (double) k / (frameCount - 1) * (keyPoses.size() - 1);
    int i = Math.min((int) Math.floor(t), keyPoses.size() - 2);
    double u = t - i;
    double s = u * u * (3 - 2 * u);
    Pose a = keyPoses.get(i);
    Pose b = keyPoses.get(i + 1);
    return new Pose(a.x + s * (b.x - a.x), a.y + s * (b.y - a.y), a.zoom + s * (b.zoom - a.zoom),
        a.rollDegrees + s * (b.rollDegrees - a.rollDegrees));
  }

  /** Frame k, 8-bit RGB; the caller releases it. Outside the scene the camera sees dark grey. */
  public Mat frame(int k) {
    Mat transform = sceneToFrame(k);
    Mat frame = new Mat();
    Imgproc.warpAffine(scene.rgb, frame, transform, frameSize, Imgproc.INTER_LINEAR,
        Core.BORDER_CONSTANT, new Scalar(48, 48, 48));
    transform.release();
    return frame;
  }

  /**
   * The true rectangle of every scene line in frame k, in the scene's order; null for a line whose
   * rectangle is not wholly inside the frame.
   */
  public List<SceneLine> truth(int k) {
    Pose pose = pose(k);
    double[] m = affine(k);
    List<SceneLine> lines = new ArrayList<>();
    for (SceneLine line : scene.lines) {
      Point c = line.rect.center;
      RotatedRect moved =
          new RotatedRect(new Point(m[0] * c.x + m[1] * c.y + m[2], m[3] * c.x + m[4] * c.y + m[5]),
              new Size(line.rect.size.width * pose.zoom, line.rect.size.height * pose.zoom),
              line.rect.angle + pose.rollDegrees);
      lines.add(inside(moved) ? new SceneLine(line.text, moved) : null);
    }
    return lines;
  }

  /** Where the scene point seen at {@code p} in frame {@code from} is seen in frame {@code to}. */
  public Point carry(Point p, int from, int to) {
    double[] a = affine(from);
    double[] b = affine(to);
    // Invert frame "from"'s similarity, then apply frame "to"'s.
    double det = a[0] * a[4] - a[1] * a[3];
    double x = p.x - a[2];
    double y = p.y - a[5];
    double sx = (a[4] * x - a[1] * y) / det;
    double sy = (-a[3] * x + a[0] * y) / det;
    return new Point(b[0] * sx + b[1] * sy + b[2], b[3] * sx + b[4] * sy + b[5]);
  }

  private double[] affine(int k) {
    Mat transform = sceneToFrame(k);
    double[] m = new double[6];
    transform.get(0, 0, m);
    transform.release();
    return m;
  }

  // A camera rolled by r degrees sees the scene turned by r degrees, clockwise on screen.
  private Mat sceneToFrame(int k) {
    Pose pose = pose(k);
    Mat transform =
        Imgproc.getRotationMatrix2D(new Point(pose.x, pose.y), -pose.rollDegrees, pose.zoom);
    transform.put(0, 2, transform.get(0, 2)[0] + frameSize.width / 2 - pose.x);
    transform.put(1, 2, transform.get(1, 2)[0] + frameSize.height / 2 - pose.y);
    return transform;
  }

  private boolean inside(RotatedRect rect) {
    Point[] corners = new Point[4];
    rect.points(corners);
    for (Point p : corners) {
      if (p.x < 0 || p.y < 0 || p.x >= frameSize.width || p.y >= frameSize.height) {
        return false;
      }
    }
    return true;
  }
}
