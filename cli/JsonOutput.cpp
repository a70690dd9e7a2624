#include <cli/JsonOutput.h>
#include <cli/Text.h>

#include <array>
#include <cmath>
#include <cstdio>
#include <utility>

#include <rapidjson/prettywriter.h>
#include <rapidjson/stringbuffer.h>

namespace cli {

struct JsonOutput::Writer {
  rapidjson::StringBuffer buffer;
  rapidjson::PrettyWriter<rapidjson::StringBuffer> json{buffer};
  bool started = false;

  Writer() { json.SetIndent(' ', 2); }

  void start() {
    if (!std::exchange(started, true)) {
      json.StartArray();
    }
  }
  void text(std::string_view value) {
    const std::string valid = validUtf8(value);
    json.String(valid.data(), static_cast<rapidjson::SizeType>(valid.size()));
  }

  void operator()(std::monostate) { json.Null(); }
  void operator()(bool value) { json.Bool(value); }
  void operator()(std::uint64_t value) { json.Uint64(value); }
  void operator()(std::int64_t value) { json.Int64(value); }
  void operator()(double value) {
    if (std::isfinite(value)) {
      json.Double(value);
    } else {
      json.Null();
    }
  }
  void operator()(const std::string& value) { text(value); }
  void operator()(const DateTime& value) { text(value.text); }
  void operator()(const Reference& value) { text(value.uri); }
  void operator()(const Scalar& value) { std::visit(*this, value); }
  void operator()(const std::vector<Scalar>& values) {
    json.SetFormatOptions(rapidjson::kFormatSingleLineArray);
    json.StartArray();
    for (const Scalar& value : values) {
      std::visit(*this, value);
    }
    json.EndArray();
    json.SetFormatOptions(rapidjson::kFormatDefault);
  }
};

namespace {

/// JSON has no number for infinities and for what is no number: such a property has no value there.
bool hasValue(const Value& value) {
  const Scalar* scalar = std::get_if<Scalar>(&value);
  const double* number = scalar == nullptr ? nullptr : std::get_if<double>(scalar);
  return !isNull(value) && (number == nullptr || std::isfinite(*number));
}

}  // namespace

JsonOutput::JsonOutput(Columns columns, Output& output)
    : columns_(std::move(columns)), output_(output), writer_(std::make_unique<Writer>()) {}

JsonOutput::~JsonOutput() = default;

void JsonOutput::write(Row row) {
  writer_->start();
  writer_->json.StartObject();
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    if (hasValue(row[i])) {
      const std::string& name = columns_[i].name;
      writer_->json.Key(name.data(), static_cast<rapidjson::SizeType>(name.size()));
      std::visit(*writer_, row[i]);
    }
  }
  writer_->json.EndObject();
  handOver();
}

void JsonOutput::finish() {
  writer_->start();
  writer_->json.EndArray();
  handOver();
  output_.write("\n");
}

void JsonOutput::handOver() {
  output_.write(escapeHighControls({writer_->buffer.GetString(), writer_->buffer.GetSize()}));
  writer_->buffer.Clear();
}

std::string escapeHighControls(std::string_view json) {
  std::string out;
  out.reserve(json.size());
  for (std::size_t i = 0; i < json.size(); ++i) {
    const auto byte = static_cast<unsigned char>(json[i]);
    const auto next = static_cast<unsigned char>(i + 1 < json.size() ? json[i + 1] : 0);
    const bool high = byte == 0xC2 && next >= 0x80 && next <= 0x9F;
    if (byte != 0x7F && !high) {
      out += json[i];
      continue;
    }
    std::array<char, 8> escape{};
    const int length = std::snprintf(escape.data(), escape.size(), "\\u%04x", unsigned{high ? next : byte});
    out.append(escape.data(), static_cast<std::size_t>(length));
    i += high ? 1U : 0U;
  }
  return out;
}

}  // namespace cli
