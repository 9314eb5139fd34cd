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

/// Binds a method to JSON: its types decide how arguments are read and how the result is written.
namespace binding {

/// Whether a dump is written to a recorder: the argument is "recorder" or null.
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

/// The JSON type of a result, as `help` names it.
template <typename Type>
constexpr std::string_view resultName() {
    if constexpr (std::is_void_v<Type>) {
        return "null";
    } else if constexpr (std::is_same_v<Type, bool> ||
                         std::is_convertible_v<Type, const ConstraintsManager*>) {
        return "boolean";
    } else if constexpr (std::is_same_v<Type, const char*> || std::is_same_v<Type, Json>) {
        return "text or null";
    } else if constexpr (std::is_same_v<Type, StringBase>) {
        return "text";
    } else if constexpr (std::is_arithmetic_v<Type> || std::is_enum_v<Type>) {
        return "integer";
    } else if constexpr (std::is_same_v<Type, ConstraintsManager::Texts>) {
        return "object of texts";
    } else if constexpr (std::is_same_v<Type, ConstraintsManager::TextSet>) {
        return "array of texts";
    } else {
        return "array of integers";
    }
}

inline constexpr std::size_t MAX_PARAMETERS = 5;

/// Arguments in the order of the parameters, of matching kinds; enumerations are numbers.
using Arguments = std::array<const Json*, MAX_PARAMETERS>;

struct Parameter {
    std::string_view name;
    Kind kind;
};

/// One method of the exported interface, or one overload of it.
struct Call {
    std::string_view name;
    std::array<Parameter, MAX_PARAMETERS> parameters;
    std::size_t count;
    std::string_view result; ///< the JSON type
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
inline Json toJson(const StringBase& text) { return toStdString(text); }
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
    // The names of a map are unique: appended without the search that setting each would do.
    Json::object_t object;
    for (const auto& [name, text] : texts) {
        object.emplace_back(toStdString(name), toJson(text));
    }
    return object;
}

/// The parameters besides the manager and the result of a method, static method or function on the manager.
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
            resultName<std::remove_cv_t<std::remove_reference_t<Result>>>(),
            [](ConstraintsManager& manager, const Arguments& arguments) {
                return invoke<Method>(manager, arguments, Signature<Result, Types...>(),
                                      std::index_sequence_for<Types...>());
            }};
}

/// The row of a method, or of a function on the manager that replaces one: its name and the names of its parameters.
template <auto Method, typename... Names>
constexpr Call call(std::string_view name, Names... names) {
    return call<Method>(name, decltype(signature(Method))(), names...);
}

} // namespace binding
