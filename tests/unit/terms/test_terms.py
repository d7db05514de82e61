"""The term tables contain what the service needs, well-formed in every language."""

import re
import unicodedata

import pytest

from term_tables import ALL_ROWS, ENGLISH_ONLY, LANGUAGES, ROWS, TABLES, TERMS, TERMS_BY_KEY

# Texts on which other parts of the service and its users rely.
FIXED_TEXTS = {
    "kUsageTypeChannelName": "Channel Name",
    "kUsageTypeDevice": "Device",
    "kUsageTypeLineNumber": "Line Number",
    "kUsageTypeBadToken": "Bad Token",
    "kUsageTypeName": "Name",
    "kUsageTypeReservedBySessions": "Reserved by Sessions",
}
ATTRIBUTE_IDS = (
    "kUsageTypeAttributeId",
    "kUsageTypeAttributeIdentifier",
    "kUsageTypeAffectedAttribute",
    "kUsageTypeConflictingAttr",
    "kUsageTypeConflictingProperty",
    "kUsageTypeUnspecifiedProperty",
)


# The tables


def test_there_are_634_keys_in_two_families_and_no_key_twice():
    keys = [row["key"] for row in ALL_ROWS]
    assert len(set(keys)) == len(keys) == 634
    assert sum(re.fullmatch(r"kUsageType[A-Z]\w+", key) is not None for key in keys) == 500
    assert sum(re.fullmatch(r"kAuxTerm[A-Z]\w+", key) is not None for key in keys) == 134


@pytest.mark.parametrize("name", TABLES)
def test_each_table_holds_one_family_in_ascending_order_of_keys(name):
    keys = [row["key"] for row in ROWS[name]]
    prefix = "kUsageType" if name.startswith("usage") else "kAuxTerm"
    assert all(key.startswith(prefix) for key in keys)
    assert keys == sorted(keys)


def test_57_usage_types_of_the_family_are_english_only():
    assert len(ENGLISH_ONLY) == 57
    assert ENGLISH_ONLY <= {row["key"] for row in ROWS["usage_family.tsv"]}


def test_only_translations_of_english_only_keys_are_missing():
    for row in ALL_ROWS:
        assert row["eng"], row["key"]
        for language in LANGUAGES[1:]:
            assert bool(row[language]) == (row["key"] not in ENGLISH_ONLY), (row["key"], language)


def test_texts_are_normalized_and_have_no_blanks_at_their_ends():
    for row in ALL_ROWS:
        for column, text in row.items():
            assert unicodedata.is_normalized("NFC", text), (row["key"], column)
            assert text == text.strip(), (row["key"], column)
            assert "  " not in text, (row["key"], column)


def test_no_two_keys_have_the_same_english_text():
    texts = [row["eng"].casefold() for row in ALL_ROWS]
    assert sorted(texts) == sorted(set(texts))


def test_english_phrases_are_sentences_or_headers():
    for row in ALL_ROWS:
        if row["key"].startswith("kAuxTerm"):
            assert re.fullmatch(r"[A-Z].*[.:]", row["eng"]), row["key"]


def test_english_labels_are_in_title_case():
    for row in ALL_ROWS:
        if row["key"].startswith("kUsageType"):
            first, *words = re.split(r"[ -]", row["eng"])
            assert first[0].isupper(), row["key"]
            assert all(word[0].isupper() or word in ("and", "by", "for", "of", "per")
                       for word in words), row["key"]


@pytest.mark.parametrize("key", ATTRIBUTE_IDS)
def test_each_attribute_id_has_a_term(key):
    assert TERMS_BY_KEY[key]["eng"]


def test_each_tag_in_the_sources_of_the_service_has_an_english_term():
    folder = TERMS.parents[1] / "src"
    sources = [path.read_text(encoding="utf-8") for path in folder.rglob("*")
               if path.suffix in (".cpp", ".h")]
    tags = set(re.findall(r'"(k(?:UsageType|AuxTerm)\w*)"', "\n".join(sources)))
    assert {"kUsageTypeDetails", "kUsageTypeSessionId"} <= tags
    assert [tag for tag in sorted(tags) if not TERMS_BY_KEY.get(tag, {}).get("eng")] == []


def test_each_tag_and_phrase_of_the_simulated_driver_has_a_term():
    details = (TERMS.parents[1] / "simulator" / "status" / "Details.h").read_text(encoding="utf-8")
    keys = re.findall(r'"(k(?:UsageType|AuxTerm)\w+)"', details)
    assert keys and set(keys) <= set(TERMS_BY_KEY)


@pytest.mark.parametrize("key", FIXED_TEXTS)
def test_fixed_texts_are_unchanged(key):
    assert TERMS_BY_KEY[key]["eng"] == FIXED_TEXTS[key]


# The translations

ABBREVIATIONS = {"DC", "DMA", "DNS", "FIFO", "FPGA", "ID", "IP", "MAC", "NVMEM", "URL", "UTF"}

# How the word of the first column is translated wherever an English text contains it.
GLOSSARY = """
attribute       attribut         attribut       属性       속성       特性
buffer          tampon           puffer         バッファ   버퍼       缓冲区
calibration     étalonnage       kalibrier      校正       교정       校准
channel         voie|canal       kanal|kanäle   チャンネル 채널       通道
chassis         châssis          chassis        シャーシ   섀시       机箱
clock           horloge          takt           クロック   클럭       时钟
controller      contrôleur       controller     コントローラ 컨트롤러 控制器
device          périphérique     gerät          デバイス   디바이스   设备
excitation      excitation       anregung       励起       여기       激励
file            fichier          datei          ファイル   파일       文件
firmware        firmware         firmware       ファームウェア 펌웨어 固件
module          module           modul          モジュール 모듈       模块
power           puissance|alimentation leistung|energie|netzteil|stromversorgung 電力|電源 전력|전원 功率|电源
propert(y|ies)  propriété        eigenschaft    プロパティ 프로퍼티   属性
range           plage            bereich        範囲       범위       范围
register        registre         register       レジスタ   레지스터   寄存器
relay           relais           relais         リレー     릴레이     继电器
route           route            route          経路       경로       路由
scale           échelle          skalierung     スケール   스케일     标度
session         session          sitzung        セッション 세션       会话
slot            emplacement      steckpl        スロット   슬롯       插槽
task            tâche            task           タスク     태스크     任务
temperature     température      temperatur     温度       온도       温度
terminal        borne|bornier    anschl[uü]ss      端子       터미널     接线
timeout         d'attente        zeitlimit      タイムアウト 타임아웃 超时
trigger         déclenchement    trigger        トリガ     트리거     触发
version         version          version        バージョン 버전       版本
voltage         tension          spannung       電圧       전압       电压
"""


def own_texts(language):
    """Yield (key, text) of each text that a language words itself."""
    for row in ALL_ROWS:
        if row[language] and row[language] != row["eng"]:
            yield row["key"], row[language]


@pytest.mark.parametrize("language", LANGUAGES[1:])
def test_a_translation_repeats_the_english_text_only_where_marked(language):
    marked = {row["key"] for row in ALL_ROWS
              if language in row["remark"].removeprefix("same-as-english:").split(",")}
    assert {row["key"] for row in ALL_ROWS if row[language] == row["eng"]} == marked
    assert len(marked) <= 10


@pytest.mark.parametrize("language", LANGUAGES[1:])
def test_no_two_keys_have_the_same_translation(language):
    texts = [row[language].casefold() for row in ALL_ROWS if row[language]]
    assert sorted(texts) == sorted(set(texts))


@pytest.mark.parametrize("language, sentence_end, header_end", [
    ("fra", ".", "\u00a0:"), ("deu", ".", ":"), ("jpn", "。", ":"), ("kor", ".", ":"),
    ("chs", "。", "："),
])
def test_phrases_end_as_their_english_text_does(language, sentence_end, header_end):
    for row in ALL_ROWS:
        if row["key"].startswith("kAuxTerm"):
            end = header_end if row["eng"].endswith(":") else sentence_end
            assert row[language].endswith(end), (row["key"], row[language])


@pytest.mark.parametrize("language", LANGUAGES[1:])
def test_labels_do_not_end_like_phrases(language):
    for key, text in own_texts(language):
        assert key.startswith("kAuxTerm") or text[-1] not in ".:。：", (key, text)


@pytest.mark.parametrize("language", ("fra", "deu"))
def test_european_texts_begin_with_a_capital_and_keep_to_latin_1(language):
    for key, text in own_texts(language):
        assert text[0].isupper(), (key, text)
        text.encode("latin-1")


@pytest.mark.parametrize("language, letter, charset", [
    ("jpn", "[\u3041-\u3096\u30a1-\u30fa\u4e00-\u9fff]", "shift_jis"),
    ("kor", "[\uac00-\ud7a3]", "euc_kr"),
    ("chs", "[\u4e00-\u9fff]", "gb2312"),
])
def test_asian_texts_use_their_own_script(language, letter, charset):
    for key, text in own_texts(language):
        assert re.search(letter, text), (key, text)
        text.encode(charset)  # GB 2312, for one, leaves out traditional forms
        assert set(re.findall(r"[A-Za-z]+", text)) <= ABBREVIATIONS, (key, text)


def test_korean_texts_hold_no_chinese_characters():
    for key, text in own_texts("kor"):
        assert not re.search("[\u3041-\u30fa\u4e00-\u9fff]", text), (key, text)


def test_chinese_texts_hold_no_kana():
    for key, text in own_texts("chs"):
        assert not re.search("[\u3041-\u30fa]", text), (key, text)


@pytest.mark.parametrize("entry", GLOSSARY.strip().split("\n"), ids=lambda entry: entry.split()[0])
def test_a_word_is_translated_the_same_everywhere(entry):
    english, *renderings = entry.split()
    uses = [row for row in ALL_ROWS
            if row["fra"] and re.search(rf"\b{english}s?\b", row["eng"], re.IGNORECASE)]
    assert uses
    for row in uses:
        for language, rendering in zip(LANGUAGES[1:], renderings, strict=True):
            assert re.search(rendering, row[language], re.IGNORECASE), (row["key"], row[language])
