// Checks and questions: each function puts one question to the manager.
#include "Boundary.h"

using namespace boundary;

extern "C" {

tarvik_status tarvik_check_output(int mode, int output, int* allowed) {
    return answerByManager(allowed, [=](ConstraintsManager& manager) {
        return manager.checkConstraints(boundary::mode(mode), boundary::output(output));
    });
}

tarvik_status tarvik_check_device(int mode, const char* device, const char* package, int* allowed) {
    return answerByManager(allowed, [=](ConstraintsManager& manager) {
        return manager.checkConstraints(boundary::mode(mode), device, package);
    });
}

tarvik_status tarvik_check_output_and_device(int mode, int output, const char* device, const char* package,
                                             int* allowed) {
    return answerByManager(allowed, [=](ConstraintsManager& manager) {
        return manager.checkConstraints(boundary::mode(mode), boundary::output(output), device, package);
    });
}

tarvik_status tarvik_check_operation(int mode, int output, const char* device, int operation,
                                     const char* family, int* allowed) {
    return answerByManager(allowed, [=](ConstraintsManager& manager) {
        return manager.checkConstraints(boundary::mode(mode), boundary::output(output), device,
                                        boundary::operation(operation), family);
    });
}

tarvik_status tarvik_check_operation_property(const char* device, int mode, int operation, const char* family,
                                              int* allowed) {
    return answerByManager(allowed, [=](ConstraintsManager& manager) {
        return manager.checkConstraints(device, boundary::mode(mode), boundary::operation(operation), family);
    });
}

tarvik_status tarvik_get_device_operations(const char* device, int mode, int output,
                                           std::uint32_t* operations) {
    return answerByManager(operations, [=](ConstraintsManager& manager) {
        return manager.getDeviceOperations(device, boundary::mode(mode), boundary::output(output));
    });
}

tarvik_status tarvik_get_program_options(const char* device, int mode, int output, const char* package,
                                         std::uint32_t* options) {
    return answerByManager(options, [=](ConstraintsManager& manager) {
        return manager.getProgramOptions(device, boundary::mode(mode), boundary::output(output), package);
    });
}

tarvik_status tarvik_get_bsdl_operations(const char* device, int output, std::uint32_t* operations) {
    return answerByManager(operations, [=](ConstraintsManager& manager) {
        return manager.getBsdlOperations(device, boundary::output(output));
    });
}

tarvik_status tarvik_get_device_operation_options(const char* device, const char* operation, int mode,
                                                  const tarvik_text_set** options) {
    return answerByManager(options, [=](ConstraintsManager& manager) {
        return toC(manager.getDeviceOperationOptions(device, operation, boundary::mode(mode)));
    });
}

tarvik_status tarvik_get_device_string_properties(const char* device, const char* key,
                                                  const tarvik_text_set** values) {
    return answerByManager(values, [=](ConstraintsManager& manager) {
        return toC(manager.getDeviceStringProperties(device, key));
    });
}

tarvik_status tarvik_get_device_string_property(const char* device, const char* key, const char** value) {
    return answerByManager(
        value, [=](ConstraintsManager& manager) { return manager.getDeviceStringProperty(device, key); });
}

tarvik_status tarvik_get_device_bool_property(const char* device, const char* key, int* value) {
    return answerByManager(
        value, [=](ConstraintsManager& manager) { return manager.getDeviceBoolProperty(device, key); });
}

tarvik_status tarvik_get_device_long_property(const char* device, const char* key, std::int32_t* value) {
    return answerByManager(
        value, [=](ConstraintsManager& manager) { return manager.getDeviceLongProperty(device, key); });
}

tarvik_status tarvik_get_part_family(const char* device, const char** family) {
    return answerByManager(
        family, [=](ConstraintsManager& manager) { return intern(manager.getPartFamily(device)); });
}

tarvik_status tarvik_add_cached_device_family(const char* device, const char* family) {
    return guard([=] { manager().addCachedDeviceFamily(device, family); });
}

tarvik_status tarvik_is_korvel_device(const char* device, int* known) {
    return answerByManager(known,
                           [=](ConstraintsManager& manager) { return manager.isKorvelDevice(device); });
}

tarvik_status tarvik_get_all_device_idcodes(const tarvik_text_map** idcodes) {
    return answerByManager(idcodes,
                           [](ConstraintsManager& manager) { return toC(manager.getAllDeviceIdcodes()); });
}

tarvik_status tarvik_is_spi_device(const char* device, int* is_spi) {
    return answerByManager(is_spi, [=](ConstraintsManager& manager) { return manager.isSpiDevice(device); });
}

tarvik_status tarvik_get_spi_device_string_property(const char* device, const char* property,
                                                    const char** value) {
    return answerByManager(value, [=](ConstraintsManager& manager) {
        return manager.getSpiDeviceStringProperty(device, property);
    });
}

tarvik_status tarvik_get_spi_device_bool_property(const char* device, const char* property, int* value) {
    return answerByManager(value, [=](ConstraintsManager& manager) {
        return manager.getSpiDeviceBoolProperty(device, property);
    });
}

tarvik_status tarvik_get_spi_device_long_property(const char* device, const char* property,
                                                  std::int32_t* value) {
    return answerByManager(value, [=](ConstraintsManager& manager) {
        return manager.getSpiDeviceLongProperty(device, property);
    });
}

tarvik_status tarvik_is_mb_bpi_spi_support(const char* device, const char* type_prefix, const char* width,
                                           int lead, int* supported) {
    return answerByManager(supported, [=](ConstraintsManager& manager) {
        return manager.isMbBpiSpiSupport(device, type_prefix, width, lead != 0);
    });
}

} // extern "C"
