#include "ui/pages/FieldForms.h"

#include <algorithm>
#include <array>
#include <optional>

#include "base/IsoTime.h"
#include "base/Rendering.h"
#include "metrics/BandwidthTable.h"
#include "radio/Addresses.h"
#include "radio/Bands.h"
#include "radio/CellIdentity.h"
#include "radio/Digits.h"
#include "radio/ElementaryFiles.h"
#include "radio/Frequencies.h"
#include "radio/Networks.h"

namespace qel {
namespace {

using Parts = std::vector<FieldPart>;
using Decode = Parts (*)(const RawField& field);

Parts part(std::string label, std::string text) {
  if (text.empty()) return {};
  return {{std::move(label), std::move(text)}};
}

std::optional<std::uint32_t> number(const Value* value) {
  const auto wide = value ? value->asUInt64() : std::nullopt;
  if (!wide || *wide > UINT32_MAX) return std::nullopt;
  return static_cast<std::uint32_t>(*wide);
}
std::optional<std::uint32_t> number(const RawField& field) { return number(&field.value); }

// The number of the field beside this one that has that form.
std::optional<std::uint32_t> numberBeside(const RawField& field, FieldForm form) {
  const auto found = std::ranges::find(field.message.fields, form, &FieldFacts::form);
  return found == field.message.fields.end() ? std::nullopt : number(field.record.find(found->key));
}

ByteView bytesOf(const Value* value) {
  const Bytes* bytes = value ? value->asBytes() : nullptr;
  return bytes ? ByteView(*bytes) : ByteView();
}

// In whole bytes.
std::string hexadecimal(std::uint32_t number) {
  constexpr unsigned kBits = 32;
  std::string text = "0x";
  bool begun = false;
  for (unsigned shift = kBits; shift > 0;) {
    shift -= 8;
    const auto byte = static_cast<std::uint8_t>(number >> shift);
    begun = begun || byte != 0 || shift == 0;
    if (begun) text += hexText({&byte, 1});
  }
  return text;
}

Parts yesOrNo(const RawField& field) {
  const auto value = number(field);
  return value ? part("Means", *value == 0 ? "no" : "yes") : Parts{};
}

Parts accessClasses(const RawField& field) {
  constexpr unsigned kClasses = 16;
  const auto value = number(field);
  if (!value) return {};
  std::string classes;
  for (unsigned bit = 0; bit < kClasses; ++bit) {
    if ((*value >> bit & 1U) != 0) classes += (classes.empty() ? "" : ", ") + std::to_string(bit);
  }
  return part("Classes", classes.empty() ? "none" : classes);
}

Parts channelParts(Technology technology, std::uint32_t channel,
                   std::optional<std::uint32_t> mcc = {}) {
  Parts parts = part("Frequencies", frequenciesOf(technology, channel, mcc).text());
  const std::string band = bandText(technology, channel, mcc);
  if (!band.empty()) parts.push_back({"Lies in", band});
  return parts;
}

Parts earfcn(const RawField& field) {
  const auto channel = number(field);
  return channel ? channelParts(Technology::lte, *channel) : Parts{};
}

Parts uplinkEarfcn(const RawField& field) {
  const auto channel = number(field);
  const auto frequency = channel ? lteUplinkFrequency(*channel) : std::nullopt;
  return frequency ? part("Frequency", frequency->text() + " up") : Parts{};
}

Parts lteBand(const RawField& field) {
  const auto band = number(field);
  return band ? part("Spans", lteBandSpan(*band)) : Parts{};
}

Parts uarfcn(const RawField& field) {
  const auto channel = number(field);
  return channel ? channelParts(Technology::umts, *channel) : Parts{};
}

// Where country and report leave the band open, both carriers are told.
Parts arfcn(const RawField& field) {
  const auto channel = number(field);
  if (!channel) return {};
  const Parts decided =
      channelParts(Technology::gsm, *channel, numberBeside(field, FieldForm::mcc));
  if (!decided.empty()) return decided;
  Parts both = part("If DCS 1800", gsmFrequencies(*channel, kGsmDcs1800).text());
  for (FieldPart& each : part("If PCS 1900", gsmFrequencies(*channel, kGsmPcs1900).text())) {
    both.push_back(std::move(each));
  }
  return both;
}

Parts lteBandwidth(const RawField& field) {
  static const BandwidthTable bandwidths = makeBandwidthTable();
  const auto code = field.value.asInt32();
  const auto found = code ? bandwidths.find(*code) : bandwidths.end();
  return found == bandwidths.end() ? Parts{} : part("Stands for", cellText(found->second) + " MHz");
}

// Half of the index, or the index, over an offset (36.133, 9.1.4 and 9.1.7; 25.133, 9.1.2.3;
// 45.008, 8.1.4).
Parts levelOfIndex(const RawField& field, float factor, float offset, const char* unit) {
  const auto index = number(field);
  if (!index || *index > 255) return {};
  return part("Stands for", cellText(static_cast<float>(*index) * factor + offset) + unit);
}
Parts rsrpIndex(const RawField& field) { return levelOfIndex(field, 1, -140, " dBm"); }
Parts rsrqIndex(const RawField& field) { return levelOfIndex(field, 0.5F, -19.5F, " dB"); }
Parts rscpIndex(const RawField& field) { return levelOfIndex(field, 1, -116, " dBm"); }
Parts ecnoIndex(const RawField& field) { return levelOfIndex(field, 0.5F, -24.5F, " dB"); }
Parts rxlevIndex(const RawField& field) { return levelOfIndex(field, 1, -110, " dBm"); }

Parts networkBeside(const RawField& field) {
  const auto mcc = numberBeside(field, FieldForm::mcc);
  const auto mnc = numberBeside(field, FieldForm::mnc);
  if (!mcc || !mnc) return {};
  const auto network = networkOf(*mcc, *mnc, numberBeside(field, FieldForm::mncDigits));
  return network ? part("Network", network->text()) : Parts{};
}

Parts plmn(const RawField& field) {
  const auto network = networkOfBytes(bytesOf(&field.value));
  return network ? part("MCC-MNC", network->text()) : Parts{};
}

Parts eci(const RawField& field) {
  const auto id = number(field);
  const auto cell = id ? lteCellIdentity(*id) : std::nullopt;
  if (!cell) return {};
  return {{"eNodeB", std::to_string(cell->eNodeB)}, {"Sector", std::to_string(cell->sector)}};
}

Parts utranCell(const RawField& field) {
  const auto id = number(field);
  const auto cell = id ? umtsCellIdentity(*id) : std::nullopt;
  if (!cell) return {};
  return {{"RNC", std::to_string(cell->rnc)}, {"Cell", std::to_string(cell->cell)}};
}

Parts bsic(const RawField& field) {
  const auto value = number(field);
  const auto code = value ? stationCode(*value) : std::nullopt;
  if (!code) return {};
  return {{"Colour of the network", std::to_string(code->network)},
          {"Colour of the station", std::to_string(code->station)}};
}

Parts identity(const RawField& field) {
  return part("Digits", mobileIdentity(bytesOf(&field.value)).value_or(""));
}

Parts addresses(const RawField& field) {
  Parts parts;
  for (const std::string& text : addressTexts(bytesOf(&field.value))) {
    parts.push_back({text.find(':') == std::string::npos ? "IPv4" : "IPv6", text});
  }
  return parts;
}

Parts fileName(const RawField& field) {
  const auto identifier = number(field);
  const auto* file = identifier ? findElementaryFile(*identifier) : nullptr;
  if (!file) return {};
  return {{"File", std::string(file->name)}, {"Holds", std::string(file->content)}};
}

Parts fileContent(const RawField& field) {
  const auto identifier = numberBeside(field, FieldForm::fileIdentifier);
  if (!identifier) return {};
  Parts parts;
  for (FilePart& each : partsOfFile(*identifier, bytesOf(&field.value))) {
    parts.push_back({std::move(each.label), std::move(each.text)});
  }
  return parts;
}

Parts time(const RawField& field) {
  const auto ms = field.value.asUInt64();
  return ms ? part("UTC", isoTime(*ms)) : Parts{};
}

// "54 min", "1 h 30 min 5 s"; empty below a minute, where the number says it itself.
std::string longDurationText(std::uint64_t durationMs) {
  struct Unit {
    std::uint64_t ms;
    const char* name;
  };
  constexpr std::array kUnits = {Unit{3'600'000, " h"}, Unit{60'000, " min"}, Unit{1000, " s"}};
  if (durationMs < kUnits[1].ms) return {};
  std::string text;
  for (const Unit& unit : kUnits) {
    const std::uint64_t count = durationMs / unit.ms;
    durationMs %= unit.ms;
    if (count > 0) text += (text.empty() ? "" : " ") + std::to_string(count) + unit.name;
  }
  return text;
}

Parts duration(const RawField& field) {
  const auto value = number(field);
  if (!value) return {};
  return part("Lasts", longDurationText(field.facts.unit == "ms" ? *value : *value * 1000ULL));
}

Parts tenthsOfHour(const RawField& field) {
  constexpr std::uint64_t kTenthMs = 6 * 60 * 1000;
  const auto value = number(field);
  if (!value) return {};
  return part("Lasts", *value == 0 ? "never" : longDurationText(*value * kTenthMs));
}

struct Form {
  FieldForm form;
  Decode decode;
};

constexpr std::array kForms = {
    Form{FieldForm::time, time},
    Form{FieldForm::duration, duration},
    Form{FieldForm::yesNo, yesOrNo},
    Form{FieldForm::accessClasses, accessClasses},
    Form{FieldForm::earfcn, earfcn},
    Form{FieldForm::uplinkEarfcn, uplinkEarfcn},
    Form{FieldForm::uarfcn, uarfcn},
    Form{FieldForm::arfcn, arfcn},
    Form{FieldForm::lteBand, lteBand},
    Form{FieldForm::lteBandwidth, lteBandwidth},
    Form{FieldForm::rsrpIndex, rsrpIndex},
    Form{FieldForm::rsrqIndex, rsrqIndex},
    Form{FieldForm::rscpIndex, rscpIndex},
    Form{FieldForm::ecnoIndex, ecnoIndex},
    Form{FieldForm::rxlevIndex, rxlevIndex},
    Form{FieldForm::mcc, networkBeside},
    Form{FieldForm::mnc, networkBeside},
    Form{FieldForm::mncDigits, networkBeside},
    Form{FieldForm::area, networkBeside},
    Form{FieldForm::plmn, plmn},
    Form{FieldForm::eci, eci},
    Form{FieldForm::utranCell, utranCell},
    Form{FieldForm::bsic, bsic},
    Form{FieldForm::mobileIdentity, identity},
    Form{FieldForm::address, addresses},
    Form{FieldForm::fileIdentifier, fileName},
    Form{FieldForm::fileContent, fileContent},
    Form{FieldForm::tenthsOfHour, tenthsOfHour},
};

// A field of a message that another field holds, in one text.
std::string shortText(const RawField& field) {
  const auto value = number(field);
  switch (field.facts.form) {
    case FieldForm::plmn:
      if (const Parts parts = plmn(field); !parts.empty()) return parts.front().text;
      break;
    case FieldForm::area:
    case FieldForm::temporaryIdentity:
      if (value) return cellText(*value) + " (" + hexadecimal(*value) + ")";
      break;
    default:
      break;
  }
  return cellText(field.value);
}

Parts partsOfMessage(const MessageFacts& message, const Dictionary& record) {
  Parts parts;
  for (const Dictionary::Entry& entry : record) {
    const FieldFacts* facts = message.find(entry.key.view());
    if (!facts) continue;
    parts.push_back({std::string(facts->label), shortText({*facts, entry.value, message, record})});
  }
  return parts;
}

std::string joined(const Parts& parts) {
  std::string text;
  for (const auto& [label, value] : parts) {
    if (!text.empty()) text += ", ";
    text += label + ' ' + value;
  }
  return text;
}

// An entry a part, counted from 0 as sections are.
Parts partsOfList(const MessageFacts& message, const List& list) {
  Parts parts;
  for (std::size_t i = 0; i < std::min(list.size(), kMostFieldParts); ++i) {
    const Dictionary* record = list[i].asDictionary();
    const std::string text = record ? joined(partsOfMessage(message, *record)) : std::string();
    parts.push_back({std::to_string(i), text.empty() ? "empty" : text});
  }
  if (list.size() > parts.size()) {
    parts.push_back({"And", std::to_string(list.size() - parts.size()) + " more"});
  }
  return parts;
}

}  // namespace

std::vector<FieldPart> partsOf(const RawField& field) {
  if (const MessageFacts* held = findMessageFacts(field.facts.holds)) {
    if (const List* list = field.value.asList()) return partsOfList(*held, *list);
    const Dictionary* record = field.value.asDictionary();
    return record ? partsOfMessage(*held, *record) : Parts{};
  }
  if (const ValueMeaning* meaning = meaningOf(field)) {
    return part("Means", std::string(meaning->meaning));
  }
  const auto form = std::ranges::find(kForms, field.facts.form, &Form::form);
  return form == kForms.end() ? Parts{} : form->decode(field);
}

const ValueMeaning* meaningOf(const RawField& field) {
  const auto& values = field.facts.values;
  const auto name = field.value.asText();
  const auto found =
      name ? std::ranges::find(values, *name, &ValueMeaning::name)
           : std::ranges::find(values, field.value.asInt32().value_or(-1), &ValueMeaning::value);
  return found == values.end() ? nullptr : &*found;
}

std::optional<std::int64_t> rawNumber(const RawField& field) {
  if (const ValueMeaning* meaning = meaningOf(field)) return meaning->value;
  if (const auto boolean = field.value.asBoolean()) return *boolean ? 1 : 0;
  return field.value.asInt64();
}

}  // namespace qel
