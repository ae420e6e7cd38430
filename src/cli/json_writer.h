#pragma once
#include <cstdint>
#include <string>
#include <vector>

namespace ondrel {

// A small streaming JSON writer: objects, arrays, numbers and escaped strings.
class JsonWriter {
public:
    std::string out;

    void begin_object() { open('{'); }
    void end_object() { close('}'); }
    void begin_array() { open('['); }
    void end_array() { close(']'); }
    void key(const char* k) {
        comma();
        string_value(k);
        out += ':';
        after_key_ = true;
    }
    void value(int64_t v) {
        comma();
        out += std::to_string(v);
    }
    void value(const std::string& s) {
        comma();
        string_value(s);
    }
    template <typename T>
    void array(const T* v, int n) {
        begin_array();
        for (int i = 0; i < n; ++i) value(static_cast<int64_t>(v[i]));
        end_array();
    }
    template <typename T>
    void field(const char* k, const T& v) {
        key(k);
        if constexpr (std::is_convertible_v<T, std::string>)
            value(std::string(v));
        else
            value(static_cast<int64_t>(v));
    }
    template <typename T>
    void field_array(const char* k, const T* v, int n) {
        key(k);
        array(v, n);
    }

private:
    void comma() {
        if (after_key_) {
            after_key_ = false;
            return;
        }
        if (!first_.empty() && !first_.back()) out += ',';
        if (!first_.empty()) first_.back() = false;
    }
    void open(char c) {
        comma();
        out += c;
        first_.push_back(true);
    }
    void close(char c) {
        out += c;
        first_.pop_back();
    }
    void string_value(const std::string& s);

    std::vector<bool> first_;
    bool after_key_ = false;
};

}  // namespace ondrel
