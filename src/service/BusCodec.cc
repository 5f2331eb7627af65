#include "service/BusCodec.h"

#include <cstdlib>
#include <memory>

namespace bw {

namespace {

template <class... F>
struct Overloaded : F... {
  using F::operator()...;
};

// Checks an sd-bus return value inside a reader or writer.
#define BW_TRY(expr)       \
  do {                     \
    int r_ = (expr);       \
    if (r_ < 0) return r_; \
  } while (0)

template <class T>
int readFixedArray(sd_bus_message* m, char type, std::vector<T>& out) {
  const void* data = nullptr;
  std::size_t size = 0;
  BW_TRY(sd_bus_message_read_array(m, type, &data, &size));
  const auto* items = static_cast<const T*>(data);
  out.assign(items, items + size / sizeof(T));
  return 0;
}

int readStrings(sd_bus_message* m, std::vector<std::string>& out) {
  char** strv = nullptr;
  BW_TRY(sd_bus_message_read_strv(m, &strv));
  for (char** s = strv; s && *s; ++s) {
    out.emplace_back(*s);
    std::free(*s);
  }
  std::free(strv);
  return 0;
}

// Reads the value inside a variant whose contents are `signature`; skips a
// type this format does not carry (`value` stays empty).
int readValue(sd_bus_message* m, const std::string& signature, std::optional<MessageValue>& value) {
  if (signature == "s") {
    const char* s = nullptr;
    BW_TRY(sd_bus_message_read_basic(m, 's', &s));
    value.emplace(std::string(s));
  } else if (signature == "t") {
    std::uint64_t v = 0;
    BW_TRY(sd_bus_message_read_basic(m, 't', &v));
    value.emplace(v);
  } else if (signature == "x") {
    std::int64_t v = 0;
    BW_TRY(sd_bus_message_read_basic(m, 'x', &v));
    value.emplace(v);
  } else if (signature == "b") {
    int v = 0;
    BW_TRY(sd_bus_message_read_basic(m, 'b', &v));
    value.emplace(v != 0);
  } else if (signature == "d") {
    double v = 0;
    BW_TRY(sd_bus_message_read_basic(m, 'd', &v));
    value.emplace(v);
  } else if (signature == "as") {
    std::vector<std::string> v;
    BW_TRY(readStrings(m, v));
    value.emplace(std::move(v));
  } else if (signature == "at") {
    std::vector<std::uint64_t> v;
    BW_TRY(readFixedArray(m, 't', v));
    value.emplace(std::move(v));
  } else if (signature == "ax") {
    std::vector<std::int64_t> v;
    BW_TRY(readFixedArray(m, 'x', v));
    value.emplace(std::move(v));
  } else if (signature == "ad") {
    std::vector<double> v;
    BW_TRY(readFixedArray(m, 'd', v));
    value.emplace(std::move(v));
  } else if (signature == "ab") {
    std::vector<bool> v;
    BW_TRY(sd_bus_message_enter_container(m, 'a', "b"));
    for (;;) {
      int b = 0;
      int r = sd_bus_message_read_basic(m, 'b', &b);
      BW_TRY(r);
      if (r == 0) break;
      v.push_back(b != 0);
    }
    BW_TRY(sd_bus_message_exit_container(m));
    value.emplace(std::move(v));
  } else if (signature == "aas") {
    OptionalStrings v;
    BW_TRY(sd_bus_message_enter_container(m, 'a', "as"));
    for (;;) {
      std::vector<std::string> inner;
      int r = sd_bus_message_at_end(m, false);
      BW_TRY(r);
      if (r > 0) break;
      BW_TRY(readStrings(m, inner));
      v.push_back(inner.empty() ? std::nullopt : std::optional<std::string>(inner.front()));
    }
    BW_TRY(sd_bus_message_exit_container(m));
    value.emplace(std::move(v));
  } else if (signature == "a{sv}") {
    MessageDictionary v;
    BW_TRY(readDictionary(m, v));
    value.emplace(std::move(v));
  } else {
    BW_TRY(sd_bus_message_skip(m, signature.c_str()));
  }
  return 0;
}

template <class T>
int appendFixedArray(sd_bus_message* m, char type, const std::vector<T>& v) {
  return sd_bus_message_append_array(m, type, v.data(), v.size() * sizeof(T));
}

int appendStrings(sd_bus_message* m, const std::vector<std::string>& v) {
  BW_TRY(sd_bus_message_open_container(m, 'a', "s"));
  for (const std::string& s : v) BW_TRY(sd_bus_message_append_basic(m, 's', s.c_str()));
  return sd_bus_message_close_container(m);
}

int appendValue(sd_bus_message* m, const MessageValue& value) {
  return std::visit(Overloaded{
                        [m](const std::string& v) { return sd_bus_message_append_basic(m, 's', v.c_str()); },
                        [m](std::uint64_t v) { return sd_bus_message_append_basic(m, 't', &v); },
                        [m](std::int64_t v) { return sd_bus_message_append_basic(m, 'x', &v); },
                        [m](bool v) {
                          int b = v;
                          return sd_bus_message_append_basic(m, 'b', &b);
                        },
                        [m](double v) { return sd_bus_message_append_basic(m, 'd', &v); },
                        [m](const std::vector<std::string>& v) { return appendStrings(m, v); },
                        [m](const std::vector<std::uint64_t>& v) { return appendFixedArray(m, 't', v); },
                        [m](const std::vector<std::int64_t>& v) { return appendFixedArray(m, 'x', v); },
                        [m](const std::vector<double>& v) { return appendFixedArray(m, 'd', v); },
                        [m](const std::vector<bool>& v) {
                          // sd-bus takes no bool arrays in one piece
                          BW_TRY(sd_bus_message_open_container(m, 'a', "b"));
                          for (bool b : v) {
                            int i = b;
                            BW_TRY(sd_bus_message_append_basic(m, 'b', &i));
                          }
                          return sd_bus_message_close_container(m);
                        },
                        [m](const OptionalStrings& v) {
                          BW_TRY(sd_bus_message_open_container(m, 'a', "as"));
                          for (const auto& name : v) {
                            std::vector<std::string> inner;
                            if (name) inner.push_back(*name);
                            BW_TRY(appendStrings(m, inner));
                          }
                          return sd_bus_message_close_container(m);
                        },
                        [m](const MessageDictionary& v) { return appendDictionary(m, v); },
                    },
                    value.storage());
}

}  // namespace

int readDictionary(sd_bus_message* m, MessageDictionary& dictionary) {
  BW_TRY(sd_bus_message_enter_container(m, 'a', "{sv}"));
  for (;;) {
    int r = sd_bus_message_enter_container(m, 'e', "sv");
    BW_TRY(r);
    if (r == 0) break;
    const char* key = nullptr;
    BW_TRY(sd_bus_message_read_basic(m, 's', &key));
    const std::string name = key;
    const char* contents = nullptr;
    BW_TRY(sd_bus_message_peek_type(m, nullptr, &contents));
    const std::string signature = contents ? contents : "";
    BW_TRY(sd_bus_message_enter_container(m, 'v', signature.c_str()));
    std::optional<MessageValue> value;
    BW_TRY(readValue(m, signature, value));
    BW_TRY(sd_bus_message_exit_container(m));
    BW_TRY(sd_bus_message_exit_container(m));
    if (value) dictionary.insert_or_assign(name, std::move(*value));
  }
  return sd_bus_message_exit_container(m);
}

int appendDictionary(sd_bus_message* m, const MessageDictionary& dictionary) {
  BW_TRY(sd_bus_message_open_container(m, 'a', "{sv}"));
  for (const auto& [key, value] : dictionary) {
    BW_TRY(sd_bus_message_open_container(m, 'e', "sv"));
    BW_TRY(sd_bus_message_append_basic(m, 's', key.c_str()));
    BW_TRY(sd_bus_message_open_container(m, 'v', signatureOf(value).c_str()));
    BW_TRY(appendValue(m, value));
    BW_TRY(sd_bus_message_close_container(m));
    BW_TRY(sd_bus_message_close_container(m));
  }
  return sd_bus_message_close_container(m);
}

}  // namespace bw
