#!/usr/bin/env python3
"""Writes the sample texts into the folder files/ beside this script.

The texts stand below in plain Unicode, each with the encoding in which it is stored; a few files
are bytes that no encoder makes (damaged, cut short, too small). The result is committed, so the
script is needed only after a change here; with --check it only says which files differ.
"""

import pathlib
import sys

ENGLISH = """The survey of the north slope
was finished on the third of May.
Seven drill holes, forty-two layers, one flooded boot.
Depths are in metres below the datum; dates are day.month.year.
"""

FRENCH = """Le relevé du versant nord
a été achevé le trois mai, à l’aube.
Où la couche d’argile s’épaissit, le forage dévie légèrement vers l’est.
Œuvre inachevée : les profondeurs « théoriques » restent à vérifier – coût estimé : 1 250 €.
"""

GERMAN = """Die Vermessung des Nordhangs
wurde am dritten Mai abgeschlossen. Größte Tiefe: 48 m unter Gelände.
Höhenfehler über fünf Zentimeter müssen begründet werden.
Die Grundwasserstände sind in der Tabelle für März geschätzt.
"""

SPANISH = """El estudio de la ladera norte
terminó el tres de mayo. ¿Cuántas perforaciones? ¡Siete!
La señal se debilitó después del año pasado; mañana habrá más.
Coste: 1.250 € – según el técnico, “razonable”.
"""

PORTUGUESE = """O levantamento da encosta norte
terminou a três de maio. São sete furações e quarenta e duas camadas.
A medição não está concluída: faltam os níveis de água de março.
Atenção: as cotas são relativas à estação.
"""

POLISH = """Pomiary północnego stoku
zakończono trzeciego maja. Głębokość największa: czterdzieści osiem metrów.
Źródło leży poniżej warstwy iłów, a żwir sięga aż do ścieżki.
Ćwierć próbek wysłano do Łodzi.
"""

RUSSIAN = """Съёмка северного склона
закончена третьего мая. Семь скважин, сорок два слоя.
Глубины указаны в метрах от условного нуля.
Образцы из второй скважины отправлены в лабораторию.
"""

GREEK = """Η αποτύπωση της βόρειας πλαγιάς
ολοκληρώθηκε στις τρεις Μαΐου. Επτά γεωτρήσεις, σαράντα δύο στρώματα.
Τα βάθη δίνονται σε μέτρα κάτω από το σημείο αναφοράς.
Ο πύργος του νερού είναι ορατός από κάθε θέση.
"""

TURKISH = """Kuzey yamacının ölçümü
üç Mayıs'ta bitti. Yedi sondaj, kırk iki tabaka.
Derinlikler başlangıç noktasından aşağıya doğru metre olarak verilir.
İğneli ağaçların altında kalın bir çakıl tabakası görüldü; şimdilik değişiklik yok.
"""

HEBREW = """מדידת המדרון הצפוני
הסתיימה בשלישי במאי. שבעה קידוחים, ארבעים ושתיים שכבות.
העומקים נמדדים במטרים מתחת לנקודת הייחוס.
הדגימות נשלחו אתמול למעבדה.
"""

ARABIC = """انتهى مسح المنحدر الشمالي
في الثالث من مايو. سبع آبار واثنتان وأربعون طبقة.
الأعماق بالأمتار تحت نقطة الإسناد.
أرسلت العينات إلى المختبر أمس، فمتى تصل النتائج؟
"""

JAPANESE = """北斜面の測量は
五月三日に終わりました。掘削孔は七本、地層は四十二枚です。
深さは基準点からのメートル数で示します。
二番目の孔の試料は、きのう研究室へ送りました。
"""

JAPANESE_KANA = """ハンコウデ ミツケタ イワノ ナマエヲ カク。
とうほくの ちそうは うすく、すなが おおい。
ボーリングは あした つづけます。コーヒーは ポットに あります。
"""

CHINESE_SIMPLIFIED = """北坡的测量
于五月三日完成。共有七个钻孔,四十二层。
深度以基准点以下的米数表示。
第二个钻孔的样品昨天已经送到实验室,结果下周才能知道。
"""

CHINESE_TRADITIONAL = """北坡的測量
於五月三日完成。共有七個鑽孔,四十二層。
深度以基準點以下的公尺數表示。
第二個鑽孔的樣品昨天已經送到實驗室,結果下週才能知道。
"""

KOREAN = """북쪽 비탈의 측량은
오월 삼일에 끝났습니다. 시추공은 일곱 개, 지층은 마흔두 겹입니다.
깊이는 기준점 아래의 미터로 적습니다.
두 번째 시추공의 시료는 어제 연구실로 보냈습니다.
"""

HINDI = """उत्तरी ढलान का सर्वेक्षण
तीन मई को पूरा हुआ। सात छेद, बयालीस परतें।
गहराई मीटर में है।
"""

MENU = """╔══════════════════════════╗
║  SLOPE RECORDER   v2.1   ║
╠══════════════════════════╣
║ 1  New bore hole         ║
║ 2  Layers  (½ m steps)   ║
║ 3  Résumé of the day     ║
║ 4  Temperature °C        ║
╚══════════════════════════╝
"""

SIGNS = """Weather log, with the signs that the crew uses:
Monday 🌧 17 mm, Tuesday 🌤 dry, Wednesday ⛈ (stopped at noon).
Mood: 🙂 🙂 😐 🙂
"""

XML = """<?xml version="1.0" encoding="{encoding}"?>
<survey slope="{slope}">
  <hole number="1" depth="48.0">{note}</hole>
</survey>
"""


def dos(text):
    """Text with the line ends of the systems that wrote such files."""
    return text.replace("\n", "\r\n")


def late_accent():
    """Some 20 KB that are plain ASCII up to the last lines."""
    lines = [f"hole {1 + n % 7}; layer {1 + n // 7:3d}; depth {0.5 * n:7.2f} m; sand, grey, dry\n" for n in range(400)]
    return "".join(lines) + "hole 7; last layer; depth  200.00 m; näytteenottaja: Päivi Mäkelä – hyvää työtä\n"


def files():
    yield "ascii-english.txt", ENGLISH.encode("ascii")
    yield "utf8-french.txt", FRENCH.encode("utf-8")
    yield "utf8-hindi.txt", HINDI.encode("utf-8")
    yield "utf8-chinese.txt", CHINESE_SIMPLIFIED.encode("utf-8")
    yield "utf8-signs.txt", SIGNS.encode("utf-8")
    yield "utf8-bom-german.txt", GERMAN.encode("utf-8-sig")
    yield "utf16le-bom-japanese.txt", b"\xff\xfe" + dos(JAPANESE).encode("utf-16-le")
    yield "utf16be-bom-greek.txt", b"\xfe\xff" + GREEK.encode("utf-16-be")
    yield "utf16le-english.txt", dos(ENGLISH).encode("utf-16-le")
    yield "utf16be-english.txt", ENGLISH.encode("utf-16-be")
    yield "utf16le-french.txt", dos(FRENCH).encode("utf-16-le")
    yield "windows1252-spanish.txt", dos(SPANISH).encode("cp1252")
    yield "windows1250-polish.txt", dos(POLISH).encode("cp1250")
    yield "windows1251-russian.txt", dos(RUSSIAN).encode("cp1251")
    yield "windows1253-greek.txt", dos(GREEK).encode("cp1253")
    yield "windows1254-turkish.txt", dos(TURKISH).encode("cp1254")
    yield "windows1255-hebrew.txt", dos(HEBREW).encode("cp1255")
    yield "windows1256-arabic.txt", dos(ARABIC).encode("cp1256")
    yield "shiftjis-japanese.txt", dos(JAPANESE).encode("cp932")
    yield "eucjp-japanese.txt", JAPANESE_KANA.encode("euc-jp")
    yield "gbk-chinese.txt", dos(CHINESE_SIMPLIFIED).encode("gbk")
    yield "big5-chinese.txt", dos(CHINESE_TRADITIONAL).encode("big5")
    yield "euckr-korean.txt", KOREAN.encode("euc-kr")
    yield "oem437-menu.txt", dos(MENU).encode("cp437")
    yield "oem850-portuguese.txt", dos(PORTUGUESE).encode("cp850")
    yield "oem866-russian.txt", dos(RUSSIAN).encode("cp866")
    yield "koi8r-russian.txt", RUSSIAN.encode("koi8-r")
    yield "xml-ascii.xml", XML.format(encoding="us-ascii", slope="north", note="dry").encode("ascii")
    yield "xml-windows1252.xml", XML.format(encoding="windows-1252", slope="Südhang", note="tonig, ½ m Kies").encode("cp1252")
    yield "xml-utf8.xml", XML.format(encoding="UTF-8", slope="južno pobočje", note="ilovica, 3 €").encode("utf-8")
    yield "xml-utf16le.xml", XML.format(encoding="UTF-16", slope="jižní svah", note="štěrk").encode("utf-16-le")
    yield "xml-utf16be-bom.xml", b"\xfe\xff" + XML.format(encoding="UTF-16", slope="jižní svah", note="štěrk").encode("utf-16-be")
    yield "late-accent.txt", late_accent().encode("utf-8")
    # A two-byte character that lost its second byte, and one byte that never starts a character.
    yield "damaged-utf8.txt", FRENCH.encode("utf-8").replace("é".encode("utf-8"), b"\xc3", 1) + b"\xff\n"
    yield "cut-utf16le.txt", (b"\xff\xfe" + GERMAN.encode("utf-16-le"))[:-1]
    yield "nuls.dat", b"QXREC\x00\x01\x00" + b"".join(b"hole\x00\x00%d\x00\xfe\x80" % n for n in range(40))
    yield "two-bytes.txt", "ü".encode("utf-8")
    yield "empty.txt", b""


def main():
    folder = pathlib.Path(__file__).resolve().parent / "files"
    check = sys.argv[1:] == ["--check"]
    if sys.argv[1:] and not check:
        sys.exit("usage: make.py [--check]")
    wanted = dict(files())
    present = {path.name: path.read_bytes() for path in folder.iterdir()} if folder.is_dir() else {}
    differing = sorted(name for name in wanted.keys() | present.keys() if wanted.get(name) != present.get(name))
    if check:
        for name in differing:
            print(f"{name}: not what this script makes")
        sys.exit(1 if differing else 0)
    folder.mkdir(exist_ok=True)
    for name, content in wanted.items():
        (folder / name).write_bytes(content)
    for name in present.keys() - wanted.keys():
        (folder / name).unlink()
    print(f"{len(wanted)} files in {folder}")


if __name__ == "__main__":
    main()
