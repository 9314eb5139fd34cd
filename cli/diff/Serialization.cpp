// The form in which facts travel between processes: numbers, and texts behind their lengths.
#include "diff/Serialization.h"

#include <cstdint>
#include <cstring>
#include <utility>

namespace diff {

namespace {

class Packer {
public:
    Packer() = default;
    explicit Packer(std::size_t expectedSize) { m_bytes.reserve(expectedSize); }

    void put(std::size_t number) {
        // No list, and no text, is longer: a value is shorter than that.
        const auto fixed = static_cast<std::uint32_t>(number);
        m_bytes.append(reinterpret_cast<const char*>(&fixed), sizeof fixed);
    }
    void put(const std::string& text) {
        put(text.size());
        m_bytes += text;
    }
    template <typename Value>
    void put(const std::optional<Value>& value) {
        put(std::size_t{value.has_value()});
        if (value) {
            put(*value);
        }
    }
    void put(TARVIKNS::MODE_TYPE mode) { put(static_cast<std::size_t>(mode)); }
    void put(TARVIKNS::OUTPUT_TYPE output) { put(static_cast<std::size_t>(output)); }
    void put(const Question& question) {
        put(question.topic);
        put(static_cast<std::size_t>(question.kind));
        put(question.mode);
        put(question.output);
    }
    void put(const PackageFacts& package) {
        put(package.modes);
        put(package.options);
    }
    void put(const DeviceFacts& device) {
        put(device.family);
        put(device.own);
        put(device.shared);
        put(device.packages);
    }
    template <typename Key, typename Value>
    void put(const std::map<Key, Value>& map) {
        put(map.size());
        for (const auto& [key, value] : map) {
            put(key);
            put(value);
        }
    }
    template <typename Element>
    void put(const std::set<Element>& set) {
        putAll(set);
    }
    template <typename Element>
    void put(const std::vector<Element>& vector) {
        putAll(vector);
    }

    [[nodiscard]] std::string take() { return std::move(m_bytes); }

private:
    template <typename Range>
    void putAll(const Range& range) {
        put(range.size());
        for (const auto& element : range) {
            put(element);
        }
    }

    std::string m_bytes;
};

class Unpacker {
public:
    explicit Unpacker(std::string_view bytes) : m_rest(bytes) {}

    void get(std::size_t& number) {
        std::uint32_t fixed = 0;
        std::memcpy(&fixed, m_rest.data(), sizeof fixed);
        m_rest.remove_prefix(sizeof fixed);
        number = fixed;
    }
    void get(std::string& text) {
        const std::size_t length = count();
        text = m_rest.substr(0, length);
        m_rest.remove_prefix(length);
    }
    template <typename Value>
    void get(std::optional<Value>& value) {
        if (count() != 0) {
            get(value.emplace());
        }
    }
    void get(TARVIKNS::MODE_TYPE& mode) { mode = static_cast<TARVIKNS::MODE_TYPE>(count()); }
    void get(TARVIKNS::OUTPUT_TYPE& output) { output = static_cast<TARVIKNS::OUTPUT_TYPE>(count()); }
    void get(Question& question) {
        get(question.topic);
        question.kind = static_cast<Question::Kind>(count());
        get(question.mode);
        get(question.output);
    }
    void get(PackageFacts& package) {
        get(package.modes);
        get(package.options);
    }
    void get(DeviceFacts& device) {
        get(device.family);
        get(device.own);
        get(device.shared);
        get(device.packages);
    }
    template <typename Key, typename Value>
    void get(std::map<Key, Value>& map) {
        for (std::size_t left = count(); left != 0; --left) {
            Key key;
            get(key);
            get(map.try_emplace(map.end(), std::move(key))->second);
        }
    }
    template <typename Element>
    void get(std::set<Element>& set) {
        for (std::size_t left = count(); left != 0; --left) {
            Element element;
            get(element);
            set.insert(set.end(), std::move(element));
        }
    }
    template <typename Element>
    void get(std::vector<Element>& vector) {
        vector.resize(count());
        for (Element& element : vector) {
            get(element);
        }
    }

private:
    [[nodiscard]] std::size_t count() {
        std::size_t number = 0;
        get(number);
        return number;
    }

    std::string_view m_rest;
};

} // namespace

std::string packed(const Facts& facts) {
    // Nearly all is what devices answer themselves; growing step by step would take three times the memory.
    constexpr std::size_t OTHERWISE = 256;
    std::size_t size = 0;
    for (const auto& [name, device] : facts.devices) {
        size += device.own.size() + OTHERWISE;
    }
    Packer packer(size);
    packer.put(facts.general);
    packer.put(facts.shared);
    packer.put(facts.devices);
    return packer.take();
}

Facts unpackedFacts(std::string_view bytes) {
    Unpacker unpacker(bytes);
    Facts facts;
    unpacker.get(facts.general);
    unpacker.get(facts.shared);
    unpacker.get(facts.devices);
    return facts;
}

std::string packed(const Answers& answers) {
    Packer packer;
    packer.put(answers);
    return packer.take();
}

Answers unpackedAnswers(std::string_view bytes) {
    Answers answers;
    Unpacker(bytes).get(answers);
    return answers;
}

} // namespace diff
