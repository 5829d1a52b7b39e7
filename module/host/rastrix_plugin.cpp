// The plug-in object's life and its accessors over the about record.
#include "host/rastrix_plugin.h"

namespace Vireo {
namespace {
CRastrixPlugin* g_currentPlugin = nullptr;
}

CRastrixPlugin::CRastrixPlugin() {
  g_currentPlugin = this;
}

CRastrixPlugin::~CRastrixPlugin() {
  ReleaseCachedSuites();
  if (g_currentPlugin == this) g_currentPlugin = nullptr;
}

CRastrixPlugin* CRastrixPlugin::Current() {
  return g_currentPlugin;
}

void* CRastrixPlugin::PlatformData() const {
  return aboutRecord_ != nullptr ? aboutRecord_->platformData : nullptr;
}

const BasicSuiteTable* CRastrixPlugin::BasicSuite() const {
  return aboutRecord_ != nullptr ? aboutRecord_->basicSuite : nullptr;
}

void* CRastrixPlugin::PluginRef() const {
  return aboutRecord_ != nullptr ? aboutRecord_->pluginRef : nullptr;
}

bool CRastrixPlugin::SplitBufferSpace(uint32_t total, uint32_t& first, uint32_t& second) {
  first = total >> 1;
  second = total - first;
  return true;
}

}  // namespace Vireo
