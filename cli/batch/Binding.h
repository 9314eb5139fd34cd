#pragma once

#include "model/Vocabulary.h"
#include "text/Json.h"

#include <TarvikSmokeMgr.h>
#include <tarvik/ConstraintsManager.h>

#include <array>
#include <functional>
#include <string_view>
#include <type_traits>
#include <utility>

/// Binds a method to JSON: its types tell how arguments are read and how the result is written.
namespace binding {

/// A recorder is asked for by its name, "recorder"; null asks for none.
enum class Recorder : bool { NONE, GIVEN };

enum class Kind { BOOLEAN, TEXT, BYTES, MODE, OUTPUT, OPERATION, OPTION, RECORDER };

template <typename Type>
inline constexpr Kind KIND = Kind::TEXT;
template <>
inline constexpr Kind KIND<bool> = Kind::BOOLEAN;
template <>
inline constexpr Kind KIND<StringBase> = Kind::BYTES;
template <>
inline constexpr Kind KIND<TARVIKNS::MODE_TYPE> = Kind::MODE;
template <>
inline constexpr Kind KIND<TARVIKNS::OUTPUT_TYPE> = Kind::OUTPUT;
template <>
inline constexpr Kind KIND<TARVIKNS::OP_TYPE> = Kind::OPERATION;
template <>
inline constexpr Kind KIND<TARVIKNS::PROGRAM_OPTION> = Kind::OPTION;
template <>
inline constexpr Kind KIND<Recorder> = Kind::RECORDER;

inline constexpr std::size_t MOST_PARAMETERS = 5;

/// Arguments in the order of the parameters. They fit: numbers stand for enumerations.
using Arguments = std::array<const Json*, MOST_PARAMETERS>;

struct Parameter {
    std::string_view name;
    Kind kind;
};

/// One method of the exported interface, or one overload of it.
struct Call {
    std::string_view name;
    std::array<Parameter, MOST_PARAMETERS> parameters;
    std::size_t count;
    Json (*invoke)(ConstraintsManager& manager, const Arguments& arguments);
};

template <typename Type>
Type read(const Json& argument) {
    if constexpr (std::is_same_v<Type, const char*>) {
        return argument.is_null() ? nullptr : argument.get_ref<const std::string&>().c_str();
    } else if constexpr (std::is_same_v<Type, StringBase>) {
        if (argument.is_null()) {
            return {};
        }
        const auto& text = argument.get_ref<const std::string&>();
        return {text.data(), text.size()};
    } else if constexpr (std::is_same_v<Type, Recorder>) {
        return argument.is_null() ? Recorder::NONE : Recorder::GIVEN;
    } else if constexpr (std::is_same_v<Type, bool>) {
        return argument.get<bool>();
    } else {
        return static_cast<Type>(argument.get<int>());
    }
}

inline Json toJson(Json value) { return value; }
inline Json toJson(bool value) { return value; }
inline Json toJson(int value) { return value; }
inline Json toJson(long value) { return value; }
inline Json toJson(const char* text) { return text == nullptr ? Json() : Json(text); }
inline Json toJson(const StringBase& text) { return plain(text); }
inline Json toJson(const ConstraintsManager* manager) { return manager != nullptr; }

template <typename Type>
requires std::is_enum_v<Type> Json toJson(Type value) { return static_cast<int>(value); }

template <typename Type>
Json toJson(const std::vector<Type>& values) {
    Json list = Json::array();
    for (const Type& value : values) {
        list.push_back(toJson(value));
    }
    return list;
}

inline Json toJson(const ConstraintsManager::TextSet& texts) {
    Json list = Json::array();
    for (const StringBase& text : texts) {
        list.push_back(toJson(text));
    }
    return list;
}

inline Json toJson(const ConstraintsManager::Texts& texts) {
    // The names of a map differ already: appended as they are, since setting each searches all before it.
    Json::object_t object;
    for (const auto& [name, text] : texts) {
        object.emplace_back(plain(name), toJson(text));
    }
    return object;
}

/// What a method takes besides the manager, and gives: methods, static ones, and functions on the manager.
template <typename Result, typename... Types>
struct Signature {};

template <typename Result, typename... Types>
Signature<Result, Types...> signature(Result (*)(Types...));
template <typename Result, typename... Types>
Signature<Result, Types...> signature(Result (*)(ConstraintsManager&, Types...));
template <typename Result, typename... Types>
Signature<Result, Types...> signature(Result (ConstraintsManager::*)(Types...));
template <typename Result, typename... Types>
Signature<Result, Types...> signature(Result (ConstraintsManager::*)(Types...) const);

template <auto Method, typename Result, typename... Types, std::size_t... Index>
Json invoke(ConstraintsManager& manager, const Arguments& arguments, Signature<Result, Types...>,
            std::index_sequence<Index...>) {
    const auto call = [&]() -> Result {
        if constexpr (std::is_invocable_v<decltype(Method), ConstraintsManager&, Types...>) {
            return std::invoke(Method, manager, read<Types>(*arguments[Index])...);
        } else {
            return Method(read<Types>(*arguments[Index])...);
        }
    };
    if constexpr (std::is_void_v<Result>) {
        call();
        return nullptr;
    } else {
        return toJson(call());
    }
}

template <auto Method, typename Result, typename... Types, typename... Names>
constexpr Call call(std::string_view name, Signature<Result, Types...>, Names... names) {
    static_assert(sizeof...(Types) == sizeof...(Names));
    return {name,
            {Parameter{names, KIND<Types>}...},
            sizeof...(Names),
            [](ConstraintsManager& manager, const Arguments& arguments) {
                return invoke<Method>(manager, arguments, Signature<Result, Types...>(),
                                      std::index_sequence_for<Types...>());
            }};
}

/// The row of a method, or of a function on the manager that stands for one: its name and the names of its parameters.
template <auto Method, typename... Names>
constexpr Call call(std::string_view name, Names... names) {
    return call<Method>(name, decltype(signature(Method))(), names...);
}

} // namespace binding
