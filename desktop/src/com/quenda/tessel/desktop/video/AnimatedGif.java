package com.quenda.tessel.desktop.video;

import java.awt.image.BufferedImage;
import java.io.File;
import java.io.IOException;
import java.util.Iterator;
import javax.imageio.IIOImage;
import javax.imageio.ImageIO;
import javax.imageio.ImageTypeSpecifier;
import javax.imageio.ImageWriteParam;
import javax.imageio.ImageWriter;
import javax.imageio.metadata.IIOMetadata;
import javax.imageio.metadata.IIOMetadataNode;
import javax.imageio.stream.ImageOutputStream;

/** Frames written one by one into a looping animated GIF (javax.imageio's GIF writer). */
public final class AnimatedGif implements AutoCloseable {
  private static final String FORMAT = "javax_imageio_gif_image_1.0";

  private final ImageWriter writer;
  private final ImageOutputStream output;
  private final int delayCentiseconds;
  private boolean first = true;

  public AnimatedGif(File file, int delayMillis) throws IOException {
    Iterator<ImageWriter> writers = ImageIO.getImageWritersByFormatName("gif");
    if (!writers.hasNext()) {
      throw new IOException("no GIF writer");
    }
    writer = writers.next();
    if (file.exists() && !file.delete()) {
      throw new IOException("cannot replace " + file);
    }
    output = ImageIO.createImageOutputStream(file);
    writer.setOutput(output);
    writer.prepareWriteSequence(null);
    delayCentiseconds = Math.max(1, delayMillis / 10);
  }

  public void add(BufferedImage frame) throws IOException {
    ImageWriteParam param = writer.getDefaultWriteParam();
    IIOMetadata metadata =
        writer.getDefaultImageMetadata(ImageTypeSpecifier.createFromRenderedImage(frame), param);
    IIOMetadataNode root = (IIOMetadataNode) metadata.getAsTree(FORMAT);
    IIOMetadataNode control = child(root, "GraphicControlExtension");
    control.setAttribute("disposalMethod", "none");
    control.setAttribute("userInputFlag", "FALSE");
    control.setAttribute("transparentColorFlag", "FALSE");
    control.setAttribute("delayTime", Integer.toString(delayCentiseconds));
    control.setAttribute("transparentColorIndex", "0");
    if (first) {
      // Loop forever (the NETSCAPE2.0 application extension, count 0).
      IIOMetadataNode application = new IIOMetadataNode("ApplicationExtension");
      application.setAttribute("applicationID", "NETSCAPE");
      application.setAttribute("authenticationCode", "2.0");
      application.setUserObject(new byte[] {1, 0, 0});
      child(root, "ApplicationExtensions").appendChild(application);
      first = false;
    }
    metadata.setFromTree(FORMAT, root);
    writer.writeToSequence(new IIOImage(frame, null, metadata), param);
  }

  private static IIOMetadataNode child(IIOMetadataNode root, String name) {
    for (int i = 0; i < root.getLength(); ++i) {
      if (root.item(i).getNodeName().equalsIgnoreCase(name)) {
        return (IIOMetadataNode) root.item(i);
      }
    }
    IIOMetadataNode node = new IIOMetadataNode(name);
    root.appendChild(node);
    return node;
  }

  @Override
  public void close() throws IOException {
    writer.endWriteSequence();
    output.close();
    writer.dispose();
  }
}
