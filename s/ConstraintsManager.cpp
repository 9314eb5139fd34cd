#include "FamilyNames.h"
#include "Implementation.h"
#include "StringViews.h"

#include <UT_STR.h>

#include <utility>

// The exported methods that need a manager. Each forwards to the implementation, with null texts turned into empty ones.

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

void ConstraintsManager::setExceptions(bool exceptions) noexcept {
    m_implementation->m_exceptions = exceptions;
}

const std::vector<OP_TYPE>& ConstraintsManager::getOperationOrders() const noexcept {
    return m_implementation->m_operationOrders;
}

const std::vector<TARVIKNS::PROGRAM_OPTION>& ConstraintsManager::getProgramOptionOrders() const noexcept {
    return m_implementation->m_programOptionOrders;
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output) {
    return m_implementation->checkConstraints(mode, output);
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, const char* device, const char* package) {
    return m_implementation->checkConstraints(mode, view(device), package);
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, const char* device,
                                          const char* package) {
    return m_implementation->checkConstraints(mode, output, view(device), package);
}

bool ConstraintsManager::checkConstraints(MODE_TYPE mode, OUTPUT_TYPE output, const char* device,
                                          OP_TYPE operation, const char* /*family*/) {
    return m_implementation->checkConstraints(mode, output, view(device), operation);
}

bool ConstraintsManager::checkConstraints(const char* device, MODE_TYPE mode, OP_TYPE operation,
                                          const char* /*family*/) {
    return m_implementation->checkConstraints(view(device), mode, operation);
}

int ConstraintsManager::getDeviceOperations(const char* device, MODE_TYPE mode, OUTPUT_TYPE output) {
    return m_implementation->getDeviceOperations(device, mode, output);
}

int ConstraintsManager::getProgramOptions(const char* device, MODE_TYPE mode, OUTPUT_TYPE output,
                                          const char* package) {
    return m_implementation->getProgramOptions(device, mode, output, view(package));
}

int ConstraintsManager::getBsdlOperations(const char* device, OUTPUT_TYPE output) {
    return m_implementation->getBsdlOperations(device, output);
}

const ConstraintsManager::TextSet&
ConstraintsManager::getDeviceOperationOptions(const char* device, const char* operation, MODE_TYPE mode) {
    return m_implementation->getDeviceOperationOptions(view(device), view(operation), mode);
}

const ConstraintsManager::TextSet& ConstraintsManager::getDeviceStringProperties(const char* device,
                                                                                 const char* key) {
    return m_implementation->getDeviceStringProperties(view(device), view(key));
}

const char* ConstraintsManager::getDeviceStringProperty(const char* device, const char* key) {
    return m_implementation->getDeviceStringProperty(device, key);
}

bool ConstraintsManager::getDeviceBoolProperty(const char* device, const char* key) {
    return m_implementation->hasDevicePropertyValue(view(device), view(key), "TRUE");
}

long ConstraintsManager::getDeviceLongProperty(const char* device, const char* key) {
    const char* const text = m_implementation->getDeviceStringProperty(device, key);
    return text == nullptr ? -1 : UT_STR::AToL(text);
}

StringBase ConstraintsManager::getPartFamily(const char* device) {
    return m_implementation->getPartFamily(view(device));
}

void ConstraintsManager::addCachedDeviceFamily(const char* device, const char* family) {
    m_implementation->addCachedDeviceFamily(view(device), family);
}

bool ConstraintsManager::isKorvelDevice(const char* device) {
    return m_implementation->getPartFamily(view(device)) != familyNames::BASE;
}

const ConstraintsManager::Texts& ConstraintsManager::getAllDeviceIdcodes() const {
    return m_implementation->m_deviceIdcodes.get();
}

bool ConstraintsManager::isSpiDevice(StringBase device) const {
    return m_implementation->isSpiDevice(std::move(device));
}

const char* ConstraintsManager::getSpiDeviceStringProperty(const char* device, const char* property) const {
    return m_implementation->getSpiDeviceStringProperty(device, view(property));
}

bool ConstraintsManager::getSpiDeviceBoolProperty(const char* device, const char* property) const {
    return UT_STR::ICompare(getSpiDeviceStringProperty(device, property), "true") == 0;
}

long ConstraintsManager::getSpiDeviceLongProperty(const char* device, const char* property) const {
    return UT_STR::AToL(getSpiDeviceStringProperty(device, property));
}

bool ConstraintsManager::isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width,
                                           bool lead) const {
    return m_implementation->isMbBpiSpiSupport(device, view(typePrefix), view(width), lead);
}

void ConstraintsManager::dumpOperationsTable(TarvikSmokeMgr* recorder) {
    m_implementation->dumpOperationsTable(recorder);
}

void ConstraintsManager::dumpBsdlOperationsTable(TarvikSmokeMgr* recorder) {
    m_implementation->dumpBsdlOperationsTable(recorder);
}

void ConstraintsManager::dumpProgramOptionsTable(TarvikSmokeMgr* recorder) {
    m_implementation->dumpProgramOptionsTable(recorder);
}

void ConstraintsManager::dumpCachedDeviceFamilies(TarvikSmokeMgr* recorder) {
    m_implementation->dumpCachedDeviceFamilies(recorder);
}

void ConstraintsManager::dumpMbBpiSpi() const { m_implementation->dumpMbBpiSpi(); }
