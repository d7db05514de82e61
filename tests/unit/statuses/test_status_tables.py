"""The tables contain every code once, with well-formed texts in every language."""

import re
import unicodedata

import pytest

from status_catalogue import CATALOGUE, DRIVER, FOLDERS, SIMULATOR, TEXTS

# The codes that the service is known to raise, and the constants of the platform codes, which
# appear in the details of failures.
SERVICE_CODES = [
    -32700, -32600, -32601, -32602, -32603, -32000, -32001,
    -250800, -250801, -250812, -250819, -250828, -250829, -250832, -250833, -250860, -250901,
]
PLATFORM_CONSTANTS = {
    -52000: "qiapalerr_memoryFull",
    -52003: "qiapalerr_softwareFaultAPALInternalUseOnly",
    -52005: "qiapalerr_invalidParameter",
    -52006: "qiapalerr_resourceNotFound",
    -52008: "qiapalerr_osFault",
    -52029: "qiapalerr_unsupportedFormat",
}
# What a text names literally: members, methods, properties, quoted values and numbers.
LITERAL = re.compile(r'"[^"]+"|[A-Z][a-z]+\.[A-Za-z.]*[a-z]|[a-z]+_[a-z_]+|[a-z]+[A-Z]\w+|'
                     r"\b(?:JSON-RPC|JSON|UTF-8|NVMEM|ReadOnly|ReadWrite)\b|\d+")

# How the word of the first column is translated wherever an English text contains it.
GLOSSARY = """
array       tableau         array           配列         배열       数组
chassis     châssis         chassis         シャーシ     섀시       机箱
command     commande        befehl          コマンド     명령       命令
controller  contrôleur      controller      コントローラ 컨트롤러   控制器
device      périphérique    gerät           デバイス     디바이스   设备
details     détails         details         詳細         세부.사항  详细信息
driver      driver          treiber         ドライバ     드라이버   驱动程序
method      méthode         methode         メソッド     메서드     方法
parameters  paramètres      parameter       パラメータ   파라미터   参数
propert(y|ies) propriété    eigenschaft     プロパティ   프로퍼티   属性
register    registre        register        レジスタ     레지스터   寄存器
request     requête         anfrage         リクエスト   요청       请求
resource    ressource       ressource       リソース     리소스     资源
service     service         dienst          サービス     서비스     服务
session     session         sitzung         セッション   세션       会话
timeout     d'attente       zeitlimit       タイムアウト 타임아웃   超时
"""


def texts_in(language):
    """Yield (code, text) of each text of a language."""
    for code, texts in TEXTS.items():
        for text in texts[language]:
            yield code, text


def test_no_code_and_no_constant_occurs_twice():
    codes = [row["code"] for row in CATALOGUE + SIMULATOR]
    assert sorted(codes) == sorted(set(codes))
    constants = [row["constant"] for row in CATALOGUE]
    assert sorted(constants) == sorted(set(constants))


def test_every_code_of_the_simulated_driver_has_its_translations():
    assert {row["code"] for row in DRIVER} == {row["code"] for row in SIMULATOR}


def test_the_codes_of_the_service_are_complete():
    rows = [row for row in CATALOGUE if row["raiser"] in ("json-rpc", "service")]
    assert sorted(int(row["code"]) for row in rows) == sorted(SERVICE_CODES)


def test_the_platform_codes_are_complete_and_have_their_constants():
    rows = [row for row in CATALOGUE if row["raiser"] == "platform"]
    assert {int(row["code"]): row["constant"] for row in rows} == PLATFORM_CONSTANTS


def test_every_code_has_two_texts_in_every_language():
    for code, texts in TEXTS.items():
        assert set(texts) == set(FOLDERS), code
        assert all(happened and remedy for happened, remedy in texts.values()), code


def test_the_first_sentence_is_different_for_each_code():
    for language in FOLDERS:
        for rows in (CATALOGUE, DRIVER):
            happened = [TEXTS[int(row["code"])][language][0] for row in rows]
            assert sorted(happened) == sorted(set(happened)), language


@pytest.mark.parametrize("language", FOLDERS)
def test_texts_are_normalized_and_have_no_blanks_at_their_ends(language):
    for code, text in texts_in(language):
        assert unicodedata.is_normalized("NFC", text), (code, text)
        assert text == text.strip() and "  " not in text, (code, text)


@pytest.mark.parametrize("language, end", [
    ("eng", "."), ("fra", "."), ("deu", "."), ("jpn", "。"), ("kor", "."), ("chs", "。"),
])
def test_texts_are_sentences_so_that_details_can_follow(language, end):
    for code, text in texts_in(language):
        assert text.endswith(end), (code, text)


@pytest.mark.parametrize("language", list(FOLDERS)[1:])
def test_no_text_repeats_the_english_one(language):
    english = {text for _, text in texts_in("eng")}
    for code, text in texts_in(language):
        assert text not in english, (code, text)


@pytest.mark.parametrize("language", list(FOLDERS)[1:])
def test_names_and_numbers_are_left_as_they_are(language):
    for code, texts in TEXTS.items():
        for english, text in zip(texts["eng"], texts[language]):
            for literal in LITERAL.findall(english):
                assert literal in text, (code, literal, text)


@pytest.mark.parametrize("language", ("eng", "fra", "deu"))
def test_european_texts_begin_with_a_capital_and_keep_to_latin_1(language):
    for code, text in texts_in(language):
        assert text[0].isupper(), (code, text)
        text.encode("latin-1")


def test_french_sets_no_break_before_colons_and_semicolons():
    for code, text in texts_in("fra"):
        assert not re.search(r"[^\u00a0](;|:(?!\S))", text), (code, text)


@pytest.mark.parametrize("language, letter, charset", [
    ("jpn", "[\u3041-\u3096\u30a1-\u30fa\u4e00-\u9fff]", "shift_jis"),
    ("kor", "[\uac00-\ud7a3]", "euc_kr"),
    ("chs", "[\u4e00-\u9fff]", "gb2312"),
])
def test_asian_texts_use_their_own_script(language, letter, charset):
    for code, texts in TEXTS.items():
        known = set(re.findall(r"[A-Za-z]+", " ".join(texts["eng"])))
        for text in texts[language]:
            assert re.search(letter, text), (code, text)
            text.encode(charset)  # GB 2312, for one, leaves out traditional forms
            assert set(re.findall(r"[A-Za-z]+", text)) <= known | {"ID"}, (code, text)


def test_korean_texts_hold_no_kana_and_no_chinese_characters():
    for code, text in texts_in("kor"):
        assert not re.search("[\u3041-\u30fa\u4e00-\u9fff]", text), (code, text)


def test_chinese_texts_hold_no_kana():
    for code, text in texts_in("chs"):
        assert not re.search("[\u3041-\u30fa]", text), (code, text)


@pytest.mark.parametrize("entry", GLOSSARY.strip().split("\n"), ids=lambda entry: entry.split()[0])
def test_a_word_is_translated_the_same_everywhere(entry):
    english, *renderings = entry.split()
    uses = [(code, texts) for code, texts in TEXTS.items()
            if re.search(rf"\b{english}s?\b", LITERAL.sub("", " ".join(texts["eng"])), re.I)]
    assert uses
    for code, texts in uses:
        for language, rendering in zip(list(FOLDERS)[1:], renderings, strict=True):
            assert re.search(rendering, " ".join(texts[language]), re.I), \
                (code, texts[language])
