package com.quenda.tessel.demo;

import java.util.List;

/**
 * The demo's bundled translations, standing in for the host's OCR and machine translation: the
 * generated page prints the English sentences, line by line, and the demo draws their
 * translations in their place.
 */
final class Translations {
  /** The languages in the order the demo shows them; each switch picks that language's font. */
  static final List<String> LANGUAGES = List.of("ja", "zh-CHS", "de");

  // The printed lines. The page is drawn with Hershey fonts, which have ASCII glyphs only.
  private static final String[] SOURCE = {
      "Opening hours: Monday to Friday 9-18",
      "Please keep this door closed at all times",
      "Emergency exit",
      "Platform 3 - trains to the city centre",
      "No smoking anywhere in the building",
      "Tickets are sold at the counter",
      "Fresh coffee and cake served daily until six",
      "Lost property is on the second floor",
      "Wet floor - please walk carefully",
      "Press the button for assistance",
  };

  // Per line: Japanese, simplified Chinese, German.
  private static final String[][] LINES = {
      {"営業時間：月曜日～金曜日 9時～18時", "营业时间：周一至周五 9:00-18:00",
          "Öffnungszeiten: Montag bis Freitag 9–18 Uhr"},
      {"このドアは常に閉めてください", "请随时保持此门关闭",
          "Bitte halten Sie diese Tür stets geschlossen"},
      {"非常口", "紧急出口", "Notausgang"},
      {"3番線 – 市内中心部行き", "3号站台 – 开往市中心的列车", "Gleis 3 – Züge in die Innenstadt"},
      {"館内全面禁煙", "整栋建筑禁止吸烟", "Rauchen im ganzen Gebäude verboten"},
      {"切符は窓口でお求めください", "车票请在柜台购买", "Fahrkarten erhalten Sie am Schalter"},
      {"毎日午後6時まで、いれたてのコーヒーとケーキをご用意しています",
          "每天供应新鲜咖啡和蛋糕，直到晚上六点",
          "Frischer Kaffee und Kuchen täglich bis achtzehn Uhr"},
      {"遺失物取扱所は2階です", "失物招领处在二楼", "Fundbüro im zweiten Stock"},
      {"床が濡れています – 足元にご注意ください", "地面湿滑 – 请小心行走",
          "Nasser Boden – bitte vorsichtig gehen"},
      {"ご用の方はボタンを押してください", "如需帮助请按按钮", "Für Hilfe bitte Knopf drücken"},
  };

  private Translations() {}

  /** The English text printed as line {@code line}. */
  static String source(int line) {
    return SOURCE[line % SOURCE.length];
  }

  /** The translation of printed line {@code line} into {@code language}. */
  static String of(int line, String language) {
    int column = LANGUAGES.indexOf(language);
    if (column < 0) {
      throw new IllegalArgumentException("no translations into " + language);
    }
    return LINES[line % LINES.length][column];
  }

  /** All lines' translations into {@code language}. */
  static String[] all(int lineCount, String language) {
    String[] texts = new String[lineCount];
    for (int i = 0; i < lineCount; ++i) {
      texts[i] = of(i, language);
    }
    return texts;
  }
}
