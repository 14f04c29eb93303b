// SPDX-License-Identifier: Apache-2.0
#include "bench/convert/corpus.hpp"

#include <random>
#include <string_view>

#include "bench/convert/peers.hpp"

namespace lx::bench {
namespace {

using Phrases = std::vector<std::u16string_view>;

const Phrases kLatin = {
    u"Die Zahlungen des Monats wurden am Freitag geprüft; drei Beträge über 1.250,00 waren noch nicht gebucht.\n",
    u"The clerk copied every account number twice, because the first list had been printed on narrow paper.\n",
    u"Größere Bestellungen gehen weiterhin über das Lager in Köln, kleinere über München oder Zürich.\n",
    u"Please send the corrected statement to our office before the end of the quarter, with both signatures.\n",
    u"Herr Müller bestätigte, daß die Straße am Hafen ab März für Lastwagen gesperrt bleibt.\n",
    u"Nothing in the old records says why the café on the corner kept its books in French until 1974.\n",
    u"Für Rückfragen wählen Sie bitte 0228/5550-17; unser Büro ist täglich von 8 bis 17 Uhr geöffnet.\n",
    u"Each record holds a name, a street, a town, a balance and the date of the last change.\n",
    u"Señor Ibáñez et Mme Lefèvre ont signé le contrat à Genève; le prix n'a pas été révélé.\n",
    u"    00047  SCHRÖDER & SÖHNE      HAUPTSTRASSE 12       70173 STUTTGART        1,204.55-\n",
};

const Phrases kJapanese = {
    u"昨日の会議では、来年度の予算について長い時間をかけて話し合いました。\r\n",
    u"東京駅から歩いて十分ほどの場所に、新しい図書館が建てられる予定です。\r\n",
    u"この書類は、三月三十一日までに総務課へ提出してください。\r\n",
    u"システムの更新は土曜日の夜に行い、データのコピーを二つ残します。\r\n",
    u"ご注文番号 A-20418 の商品は、明日の午後に発送いたします。\r\n",
    u"山の上から見た海は静かで、遠くに小さな船がいくつも浮かんでいた。\r\n",
    u"「お客様のお名前とご住所を、もう一度お聞かせください」と係員が言った。\r\n",
    u"Linux 上のファイルを UTF-8 に変換して、古いホストの記録と比べた。\r\n",
    u"毎朝六時に起きて、コーヒーを飲みながら新聞を読むのが父の習慣だった。\r\n",
};

const Phrases kChinese = {
    u"昨天的会议讨论了明年的预算，大家提出了许多有用的意见。\r\n",
    u"请在三月三十一日以前把这份文件交到办公室。\r\n",
    u"新的图书馆建在火车站旁边，从学校走路大约十分钟。\r\n",
    u"订单号 B-77120 的货物将在明天下午发出，请注意查收。\r\n",
    u"系统更新安排在星期六晚上进行，所有数据都要保留两份备份。\r\n",
    u"他每天早上六点起床，一边喝茶一边看报纸。\r\n",
    u"把旧主机上的文件转换成 UTF-8 以后，需要再核对一遍记录。\r\n",
    u"山上的风很大，远处的海面上有几条小船慢慢地驶过。\r\n",
};

// Fields of records. A double-byte field is followed by a blank, as fields of a fixed length are.
const Phrases kRecords = {
    u"0004711 ",
    u"20240331",
    u"000125000 ",
    u"A-20418 ",
    u"TOKYO ",
    u"OSAKA BRANCH    ",
    u"ﾔﾏﾀﾞ ﾀﾛｳ      ",
    u"ｽｽﾞｷ ﾊﾅｺ     ",
    u"東京都千代田区 ",
    u"大阪府大阪市北区 ",
    u"山田太郎 ",
    u"鈴木花子 ",
    u"株式会社日本商事 ",
    u"横浜支店 ",
    u"普通預金 ",
    u"振込入金のお知らせ ",
    u"システム利用料 ",
    u"0312345678 ",
    u"J ",
    u"JPY 000098400+",
};

const Phrases& phrases_of(Script script) {
  switch (script) {
    case Script::latin:
      return kLatin;
    case Script::japanese:
      return kJapanese;
    case Script::chinese:
      return kChinese;
    default:
      return kRecords;
  }
}

// What stays together in a text: a field of a record, or a character of prose.
std::vector<std::string> encoded_parts(const Page& page, std::u16string_view phrase, bool whole) {
  if (whole) return {encode(page, std::u16string(phrase))};
  std::vector<std::string> parts;
  for (char16_t character : phrase) parts.push_back(encode(page, std::u16string(1, character)));
  return parts;
}

// Endless text, part by part.
class Source {
 public:
  Source(const Page& page, Script script) {
    for (std::u16string_view phrase : phrases_of(script)) {
      phrases_.push_back(encoded_parts(page, phrase, script == Script::records));
    }
    start_phrase();
  }
  const std::string& part() const { return (*phrase_)[at_]; }
  void advance() {
    if (++at_ == phrase_->size()) start_phrase();
  }
  void start_phrase() {
    phrase_ = &phrases_[random_() % phrases_.size()];
    at_ = 0;
  }

 private:
  std::vector<std::vector<std::string>> phrases_;
  std::minstd_rand random_;  // the same text in every run
  const std::vector<std::string>* phrase_ = nullptr;
  size_t at_ = 0;
};

}  // namespace

Texts compose(const Page& page, Script script, size_t size, size_t count) {
  Source source(page, script);
  std::string blank = encode(page, u" ");
  Texts texts;
  texts.bytes.reserve(size * count);
  for (size_t text = 1; text <= count; ++text) {
    texts.begins.push_back(texts.bytes.size());
    for (; texts.bytes.size() + source.part().size() <= text * size; source.advance()) texts.bytes += source.part();
    source.start_phrase();
    while (texts.bytes.size() + blank.size() <= text * size) texts.bytes += blank;
  }
  texts.begins.push_back(texts.bytes.size());
  return texts;
}

}  // namespace lx::bench
